#include "platform/processes.h"

#include <unistd.h>

#include <charconv>
#include <climits>
#include <cstring>
#include <string_view>

#include "platform/posix/folder_reader.h"
#include "platform/posix/process_folder.h"

uint32_t OwnProcessID() { return static_cast<uint32_t>(::getpid()); }

std::optional<std::vector<uint32_t>> ListNumbers(const std::string& folder) {
  constexpr size_t most = 8192;
  FolderReader entries(folder);
  if (!entries.IsOpen()) {
    return std::nullopt;
  }
  std::vector<uint32_t> numbers;
  while (const char* name = entries.Next()) {
    uint32_t number = 0;
    const auto [stop, error] = std::from_chars(name, name + std::strlen(name), number);
    if (error == std::errc() && *stop == '\0' && numbers.size() < most) {
      numbers.push_back(number);
    }
  }
  return numbers;
}

std::string ExecutableName(std::string link) {
  constexpr std::string_view deletedMark = " (deleted)";
  if (link.ends_with(deletedMark)) {
    link.resize(link.size() - deletedMark.size());
  }
  constexpr size_t longest = 259;
  return link.substr(link.rfind('/') + 1, longest);
}

std::optional<std::vector<uint32_t>> ListProcessIDs() { return ListNumbers("/proc"); }

std::optional<ProcessModule> FirstModuleOf(uint32_t processID) {
  const std::string link = "/proc/" + std::to_string(processID) + "/exe";
  char target[PATH_MAX];
  const ssize_t length = ::readlink(link.c_str(), target, sizeof target);
  if (length < 0) {
    return std::nullopt;
  }
  return ProcessModule{ExecutableName(std::string(target, static_cast<size_t>(length)))};
}

std::optional<std::vector<ProcessEntry>> SnapshotProcesses() { return std::nullopt; }
