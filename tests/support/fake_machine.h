#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "platform/accounts.h"
#include "platform/computer.h"
#include "platform/processes.h"
#include "platform/registry.h"
#include "platform/services.h"

// The machine that the logic under test sees: each test sets the answers it needs. An absent
// answer is a call that fails.
struct FakeMachine {
  std::string CommonFolder;  // the common application data folder

  std::optional<std::string> ComputerName;
  std::optional<SystemVersion> ShortVersion;
  std::optional<SystemVersion> ExtendedVersion;
  SystemInfo System;

  uint32_t OwnProcess = 0;
  std::optional<std::vector<uint32_t>> ProcessIDs;
  std::map<uint32_t, ProcessModule> Modules;
  std::optional<std::vector<ProcessEntry>> ProcessEntries;

  ServiceListing Services;
  std::function<void(std::chrono::milliseconds limit)> OnServices;  // when they are listed

  // The groups are listed for a server name that is this machine's, if it has one.
  using Groups = std::vector<std::pair<std::string, std::vector<std::string>>>;
  std::optional<std::string> DomainUser;
  std::optional<std::string> WorkstationUser;
  Groups LocalGroups;
  Groups GlobalGroups;

  // The registry in its order. A key exists if it or a key below it is named here.
  struct RegistryEntry {
    std::string KeyPath;
    std::string ValueName;  // empty: the key alone
    RegistryData Data;
  };
  std::vector<RegistryEntry> Registry;

  // The values that were asked for: key, value name, limit and access.
  std::vector<std::string> RegistryQuestions;

  void SetText(const std::string& keyPath, const std::string& name, const std::string& text);

  // Adds what a text says, line by line: [key] and below it name=text or name=dword:fffffffe.
  void Load(const std::string& text);
};

// The one machine; assign FakeMachine() to reset it.
FakeMachine& Machine();
