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

static FakeMachine::Key* FindKey(const std::string& path) {
  auto& keys = Machine().Registry;
  const auto found = std::find_if(keys.begin(), keys.end(), [&](const FakeMachine::Key& key) {
    return EqualsIgnoringCase(key.Path, path);
  });
  return found == keys.end() ? nullptr : &*found;
}

void FakeMachine::SetKey(const std::string& keyPath) {
  if (FindKey(keyPath) == nullptr) {
    Registry.push_back({keyPath, {}});
  }
}

void FakeMachine::SetData(const std::string& keyPath, const std::string& name, RegistryData data) {
  SetKey(keyPath);
  FindKey(keyPath)->Values.emplace_back(name, std::move(data));
}

void FakeMachine::SetText(const std::string& keyPath, const std::string& name,
                          const std::string& text) {
  SetData(keyPath, name, {kRegistryText, text + '\0'});
}

void FakeMachine::SetNumber(const std::string& keyPath, const std::string& name, uint32_t number) {
  std::string bytes;
  for (int shift = 0; shift < 32; shift += 8) {
    bytes += static_cast<char>(number >> shift & 0xFF);
  }
  SetData(keyPath, name, {kRegistryNumber, bytes});
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
  const FakeMachine::Key* key = FindKey(keyPath);
  if (key == nullptr) {
    return {};
  }
  for (const auto& [name, data] : key->Values) {
    if (EqualsIgnoringCase(name, valueName)) {
      return data.Bytes.size() <= limit ? data : RegistryData{data.Type, ""};
    }
  }
  return {};
}

std::vector<std::string> EnumRegistryValueNames(const std::string& keyPath) {
  std::vector<std::string> names;
  if (const FakeMachine::Key* key = FindKey(keyPath)) {
    for (const auto& [name, data] : key->Values) {
      names.push_back(name);
    }
  }
  return names;
}

std::vector<std::string> EnumRegistrySubKeys(const std::string& keyPath) {
  std::vector<std::string> names;
  const std::string prefix = keyPath + '\\';
  for (const FakeMachine::Key& key : Machine().Registry) {
    if (!EqualsIgnoringCase(key.Path.substr(0, prefix.size()), prefix)) {
      continue;
    }
    const std::string name =
        key.Path.substr(prefix.size(), key.Path.find('\\', prefix.size()) - prefix.size());
    if (std::find(names.begin(), names.end(), name) == names.end()) {
      names.push_back(name);
    }
  }
  return names;
}

std::optional<std::string> DomainUserName() { return Machine().DomainUser; }

std::optional<std::string> WorkstationUserName() { return Machine().WorkstationUser; }

using Groups = std::vector<std::pair<std::string, FakeMachine::Members>>;

static std::vector<std::string> NamesOf(const Groups& groups, const std::string& server) {
  Machine().ServersAsked.push_back(server);
  std::vector<std::string> names;
  std::transform(groups.begin(), groups.end(), std::back_inserter(names),
                 [](const auto& group) { return group.first; });
  return names;
}

static std::vector<std::string> MembersOf(const Groups& groups, const std::string& server,
                                          const std::string& name) {
  Machine().ServersAsked.push_back(server);
  const auto found = std::find_if(groups.begin(), groups.end(),
                                  [&](const auto& group) { return group.first == name; });
  return found == groups.end() ? FakeMachine::Members() : found->second;
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
