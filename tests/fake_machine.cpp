#include "tests/fake_machine.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <numeric>
#include <random>
#include <regex>
#include <set>
#include <sstream>

#include "app/install_history.h"
#include "eventlog/logger.h"
#include "history/locations.h"
#include "platform/ascii_case.h"
#include "platform/known_folders.h"
#include "platform/path.h"

static std::string commonFolder;

FakeMachine& Machine() {
  static FakeMachine machine;
  return machine;
}

ScratchHistory::ScratchHistory() {
  const auto name = "orx-test-" + std::to_string(std::random_device()());
  Root = (std::filesystem::temp_directory_path() / name).string();
  std::filesystem::create_directory(Root);
  commonFolder = Root;
  Machine() = FakeMachine();
}

ScratchHistory::~ScratchHistory() {
  std::error_code ignored;
  std::filesystem::remove_all(Root, ignored);
  commonFolder.clear();
}

std::string ScratchHistory::In(const std::string& path) const { return Native("@/" + path); }

void ScratchHistory::Make(const std::string& path) const {
  if (path.ends_with('/')) {
    std::filesystem::create_directories(In(path));
    return;
  }
  std::filesystem::create_directories(std::filesystem::path(In(path)).parent_path());
  WriteFileText(In(path), path);
}

std::string ScratchHistory::Tree() const {
  std::set<std::string> lines;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(Root)) {
    const std::string path = entry.path().string().substr(Root.size() + 1);
    lines.insert(Neutral(path) + (entry.is_directory() ? "/\n" : "\n"));
  }
  return std::accumulate(lines.begin(), lines.end(), std::string());
}

static std::string Replaced(std::string text, const std::string& old, const std::string& by) {
  for (size_t place = 0; (place = text.find(old, place)) != std::string::npos;) {
    text.replace(place, old.size(), by);
    place += by.size();
  }
  return text;
}

std::string ScratchHistory::Neutral(std::string text) const {
  std::erase(text, '\r');
  text = Replaced(Replaced(text, Root, "@"), {kPathSeparator}, "/");
  return std::regex_replace(text, std::regex("[0-9]{8} [0-9]{2}:[0-9]{2}:[0-9]{2}"), "<time>");
}

std::string ScratchHistory::Native(const std::string& text) const {
  return Replaced(Replaced(text, "/", {kPathSeparator}), "@", Root);
}

std::string InHistory(const std::string& path) {
  return JoinPath(GetHistoryDir(), Replaced(path, "/", {kPathSeparator}));
}

std::string Golden(const std::string& name) { return FileText(JoinPath(ORX_GOLDEN_FOLDER, name)); }

ProgramArguments::ProgramArguments(std::vector<std::string> words) : Words(std::move(words)) {
  Words.insert(Words.begin(), "ORXInstallEventLog");
  for (std::string& word : Words) {
    Pointers.push_back(word.data());
  }
}

static void ResetLogFormat() { CLogger::GetInstance().copyfmt(std::ios(nullptr)); }

int RunTool(std::vector<std::string> words) {
  ResetLogFormat();
  ProgramArguments arguments(std::move(words));
  return CInstallHistory().Run(arguments.Count(), arguments.Vector());
}

std::string LoggedText(const std::function<void()>& write) {
  ResetLogFormat();
  std::stringbuf text;
  std::ios& log = CLogger::GetInstance();
  std::streambuf* file = log.rdbuf(&text);
  write();
  log.rdbuf(file);
  return text.str();
}

std::string FileText(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

void WriteFileText(const std::string& path, const std::string& text) {
  std::ofstream(path, std::ios::binary) << text;
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

std::string GetFolderPath(int32_t csidl) { return csidl == 35 ? commonFolder : ""; }

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

ServiceListing ListServices() { return Machine().Services; }

RegistryData ReadRegistryData(const std::string& keyPath, const std::string& valueName,
                              size_t limit, RegistryAccess) {
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
  for (const auto& entry : Machine().Registry) {
    if (EqualsIgnoringCase(entry.KeyPath.substr(0, prefix.size()), prefix)) {
      const std::string below = entry.KeyPath.substr(prefix.size());
      const std::string name = below.substr(0, below.find('\\'));
      if (std::find(names.begin(), names.end(), name) == names.end()) {
        names.push_back(name);
      }
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
  for (const auto& [name, members] : groups) {
    names.push_back(name);
  }
  return IsOwnName(server) ? names : std::vector<std::string>();
}

static std::vector<std::string> MembersOf(const Groups& groups, const std::string& server,
                                          const std::string& group) {
  for (const auto& [name, members] : groups) {
    if (name == group && IsOwnName(server)) {
      return members;
    }
  }
  return {};
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
