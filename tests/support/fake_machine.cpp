#include "tests/support/fake_machine.h"

#include <algorithm>
#include <sstream>

#include "platform/ascii_case.h"
#include "platform/known_folders.h"

FakeMachine& Machine() {
  static FakeMachine machine;
  return machine;
}

static RegistryData DataOf(const std::string& text) {
  if (!text.starts_with("dword:")) {
    return {kRegistryText, text + '\0'};
  }
  const unsigned long number = std::stoul(text.substr(text.find(':') + 1), nullptr, 16);
  RegistryData data{kRegistryNumber, ""};
  for (int shift = 0; shift < 32; shift += 8) {
    data.Bytes += static_cast<char>(number >> shift & 0xFF);
  }
  return data;
}

void FakeMachine::SetText(const std::string& keyPath, const std::string& name,
                          const std::string& text) {
  Registry.push_back({keyPath, name, DataOf(text)});
}

void FakeMachine::Load(const std::string& text) {
  std::istringstream lines(text);
  std::string keyPath;
  for (std::string line; std::getline(lines, line);) {
    const size_t sign = line.find('=');
    if (line.starts_with('[')) {
      keyPath = line.substr(1, line.size() - 2);
      Registry.push_back({keyPath, "", {}});
    } else if (sign != std::string::npos) {
      SetText(keyPath, line.substr(0, sign), line.substr(sign + 1));
    }
  }
}

std::string GetFolderPath(int32_t csidl) { return csidl == 35 ? Machine().CommonFolder : ""; }

std::optional<std::string> ShortComputerName() { return Machine().ComputerName; }

std::optional<SystemVersion> QuerySystemVersion(VersionForm form) {
  return form == VersionForm::kExtended ? Machine().ExtendedVersion : Machine().ShortVersion;
}

SystemInfo QuerySystemInfo() { return Machine().System; }

uint32_t OwnProcessID() { return Machine().OwnProcess; }

std::optional<std::vector<uint32_t>> ListProcessIDs() { return Machine().ProcessIDs; }

std::optional<ProcessModule> FirstModuleOf(uint32_t processID) {
  const auto found = Machine().Modules.find(processID);
  return found == Machine().Modules.end() ? std::nullopt : std::optional(found->second);
}

std::optional<std::vector<ProcessEntry>> SnapshotProcesses() { return Machine().ProcessEntries; }

ServiceListing ListServices(std::chrono::milliseconds limit) {
  if (Machine().OnServices) {
    Machine().OnServices(limit);
  }
  return Machine().Services;
}

RegistryData ReadRegistryData(const std::string& keyPath, const std::string& valueName,
                              size_t limit, RegistryAccess access) {
  Machine().RegistryQuestions.push_back(keyPath + '|' + valueName + '|' + std::to_string(limit) +
                                        '|' + std::to_string(static_cast<uint32_t>(access)));
  for (const auto& [path, name, data] : Machine().Registry) {
    if (EqualsIgnoringCase(path, keyPath) && EqualsIgnoringCase(name, valueName)) {
      return data.Bytes.size() <= limit ? data : RegistryData{data.Type, ""};
    }
  }
  return {};
}

std::vector<std::string> EnumRegistryValueNames(const std::string& keyPath) {
  std::vector<std::string> names;
  for (const auto& [path, name, data] : Machine().Registry) {
    if (EqualsIgnoringCase(path, keyPath) && !name.empty()) {
      names.push_back(name);
    }
  }
  return names;
}

std::vector<std::string> EnumRegistrySubKeys(const std::string& keyPath) {
  std::vector<std::string> names;
  const std::string prefix = keyPath + '\\';
  for (const auto& [path, valueName, data] : Machine().Registry) {
    const bool isBelow = EqualsIgnoringCase(path.substr(0, prefix.size()), prefix);
    const std::string below = isBelow ? path.substr(prefix.size()) : "";
    const std::string name = below.substr(0, below.find('\\'));
    if (isBelow && std::find(names.begin(), names.end(), name) == names.end()) {
      names.push_back(name);
    }
  }
  return names;
}

std::optional<std::string> DomainUserName() { return Machine().DomainUser; }

std::optional<std::string> WorkstationUserName() { return Machine().WorkstationUser; }

using Groups = FakeMachine::Groups;

static bool IsOwnName(const std::string& server) {
  return server == (Machine().ComputerName ? "\\\\" + *Machine().ComputerName : "");
}

static std::vector<std::string> NamesOf(const Groups& groups, const std::string& server) {
  std::vector<std::string> names;
  for (size_t i = 0; i < groups.size() && IsOwnName(server); ++i) {
    names.push_back(groups[i].first);
  }
  return names;
}

static std::vector<std::string> MembersOf(const Groups& groups, const std::string& server,
                                          const std::string& group) {
  const auto found = std::find_if(groups.begin(), groups.end(),
                                  [&group](const auto& entry) { return entry.first == group; });
  return IsOwnName(server) && found != groups.end() ? found->second : std::vector<std::string>();
}

std::vector<std::string> ListLocalGroups(const std::string& server) {
  return NamesOf(Machine().LocalGroups, server);
}

std::vector<std::string> ListLocalGroupMembers(const std::string& server,
                                               const std::string& group) {
  return MembersOf(Machine().LocalGroups, server, group);
}

std::vector<std::string> ListGlobalGroups(const std::string& server) {
  return NamesOf(Machine().GlobalGroups, server);
}

std::vector<std::string> ListGlobalGroupMembers(const std::string& server,
                                                const std::string& group) {
  return MembersOf(Machine().GlobalGroups, server, group);
}
