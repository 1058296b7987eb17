#include "platform/folder_listing.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <algorithm>
#include <ctime>

#include "platform/posix/file_calls.h"
#include "platform/posix/folder_reader.h"

static uint32_t AttributesFromMode(mode_t mode) {
  constexpr uint32_t readOnly = 0x1;
  constexpr uint32_t plain = 0x80;
  constexpr mode_t anyWrite = S_IWUSR | S_IWGRP | S_IWOTH;
  if (S_ISDIR(mode)) {
    return kFolderAttribute;
  }
  return (mode & anyWrite) == 0 ? readOnly : plain;
}

std::vector<FolderEntry> ListFolder(const std::string& path) {
  FolderReader folder(path);
  std::vector<FolderEntry> entries;
  while (const char* name = folder.Next()) {
    struct stat status = {};
    const int result = RetryOnInterrupt(
        [&] { return ::fstatat(folder.Get(), name, &status, AT_SYMLINK_NOFOLLOW); });
    if (result == 0 && (S_ISREG(status.st_mode) || S_ISDIR(status.st_mode))) {
      entries.push_back(
          {name, static_cast<uint64_t>(status.st_size), AttributesFromMode(status.st_mode)});
    }
  }
  std::sort(entries.begin(), entries.end(),
            [](const FolderEntry& a, const FolderEntry& b) { return a.Name < b.Name; });
  return entries;
}

std::optional<uint32_t> FileAttributes(const std::string& path) {
  struct stat status = {};
  return StatusOf(path, Links::kNoFollow, status)
             ? std::optional(AttributesFromMode(status.st_mode))
             : std::nullopt;
}

std::optional<CalendarTime> LastWriteTime(const std::string& path) {
  struct stat status = {};
  tm local = {};
  if (!StatusOf(path, Links::kNoFollow, status) ||
      ::localtime_r(&status.st_mtim.tv_sec, &local) == nullptr) {
    return std::nullopt;
  }
  return CalendarTime{local.tm_year + 1900, local.tm_mon + 1, local.tm_mday,
                      local.tm_hour,        local.tm_min,     local.tm_sec};
}
