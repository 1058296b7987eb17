#include "platform/processes.h"

#include <dirent.h>
#include <unistd.h>

#include <charconv>
#include <climits>
#include <cstring>
#include <memory>

namespace {

struct FolderCloser {
  void operator()(DIR* folder) const { ::closedir(folder); }
};

}  // namespace

uint32_t OwnProcessID() { return static_cast<uint32_t>(::getpid()); }

std::optional<std::vector<uint32_t>> ListProcessIDs() {
  constexpr size_t most = 8192;
  const std::unique_ptr<DIR, FolderCloser> folder(::opendir("/proc"));
  if (!folder) {
    return std::nullopt;
  }
  std::vector<uint32_t> ids;
  while (const dirent* entry = ::readdir(folder.get())) {
    const char* end = entry->d_name + std::strlen(entry->d_name);
    uint32_t id = 0;
    const auto [stop, error] = std::from_chars(entry->d_name, end, id);
    if (error == std::errc() && stop == end && ids.size() < most) {
      ids.push_back(id);
    }
  }
  return ids;
}

std::optional<ProcessModule> FirstModuleOf(uint32_t processID) {
  const std::string link = "/proc/" + std::to_string(processID) + "/exe";
  char target[PATH_MAX];
  const ssize_t length = ::readlink(link.c_str(), target, sizeof target);
  if (length < 0) {
    return std::nullopt;
  }
  std::string file(target, static_cast<size_t>(length));
  constexpr std::string_view deletedMark = " (deleted)";  // the kernel's, on a replaced executable
  if (file.ends_with(deletedMark)) {
    file.resize(file.size() - deletedMark.size());
  }
  constexpr size_t longest = 259;
  return ProcessModule{file.substr(file.rfind('/') + 1, longest)};
}

std::optional<std::vector<ProcessEntry>> SnapshotProcesses() { return std::nullopt; }
