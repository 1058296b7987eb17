#pragma once

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
  std::optional<std::string> ComputerName;
  std::optional<SystemVersion> ShortVersion;
  std::optional<SystemVersion> ExtendedVersion;
  SystemInfo System;

  uint32_t OwnProcess = 0;
  std::optional<std::vector<uint32_t>> ProcessIDs;
  std::map<uint32_t, ProcessModule> Modules;
  std::optional<std::vector<ProcessEntry>> ProcessEntries;

  ServiceListing Services;

  // The groups are told to those who ask this machine by its name, if it has one.
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
  void SetText(const std::string& keyPath, const std::string& name, const std::string& text);

  // Adds what a text says, line by line: [key] and below it name=text or name=dword:fffffffe.
  void Load(const std::string& text);
};

// The one machine; assign FakeMachine() to begin anew.
FakeMachine& Machine();

// Makes an empty folder that is the common application data folder from here on, removed with the
// object; the machine is new as well.
class ScratchHistory {
 public:
  ScratchHistory();
  ~ScratchHistory();
  ScratchHistory(const ScratchHistory&) = delete;
  ScratchHistory& operator=(const ScratchHistory&) = delete;

  // Paths are given with slashes, whatever the platform's separator.
  std::string In(const std::string& path) const;

  // Makes a file that holds its own path as given, or a folder if that ends in a slash; the folders
  // above it too.
  void Make(const std::string& path) const;

  // Every file and folder, a line each, a folder's with a slash at its end.
  std::string Tree() const;

  // A text with "@" for the root, "<time>" for a time stamp, slashes and plain line ends: the same
  // on every machine, as the golden texts are. And from such a text the one for this machine.
  std::string Neutral(std::string text) const;
  std::string Native(const std::string& text) const;

  std::string Root;
};

// A path below the history folder.
std::string InHistory(const std::string& path);

std::string Golden(const std::string& name);

// An argument vector as the system hands it to main, the program's name in front.
class ProgramArguments {
 public:
  explicit ProgramArguments(std::vector<std::string> words);
  int Count() const { return static_cast<int>(Pointers.size()); }
  char** Vector() { return Pointers.data(); }

 private:
  std::vector<std::string> Words;
  std::vector<char*> Pointers;
};

// One run of the tool in this process, as CInstallHistory::Run; gives its result. Like a process of
// its own it begins with a stream that nothing has been set at.
int RunTool(std::vector<std::string> words);

// What is written to the CLogger stream meanwhile, from a stream on that nothing has been set at.
std::string LoggedText(const std::function<void()>& write);

// All bytes of a file; empty if it cannot be read. Text as it is on disk.
std::string FileText(const std::string& path);
void WriteFileText(const std::string& path, const std::string& text);
