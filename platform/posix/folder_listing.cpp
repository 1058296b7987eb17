#include "platform/folder_listing.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>

#include <algorithm>
#include <ctime>
#include <memory>

#include "platform/posix/file_calls.h"

static uint32_t AttributesFromMode(mode_t mode) {
  constexpr uint32_t readOnly = 0x1;
  constexpr uint32_t plain = 0x80;
  constexpr mode_t anyWrite = S_IWUSR | S_IWGRP | S_IWOTH;
  if (S_ISDIR(mode)) {
    return kFolderAttribute;
  }
  return (mode & anyWrite) == 0 ? readOnly : plain;
}

// Null after the last entry, and without a folder.
static const dirent* NextEntry(DIR* folder) {
  return folder == nullptr ? nullptr : RetryOnInterrupt([folder] {
    errno = 0;  // at the end of the folder readdir returns null and leaves it as it is
    return ::readdir(folder);
  });
}

std::vector<FolderEntry> ListFolder(const std::string& path) {
  struct Closer {
    void operator()(DIR* folder) const { ::closedir(folder); }
  };
  const std::unique_ptr<DIR, Closer> folder(
      RetryOnInterrupt([&] { return ::opendir(path.c_str()); }));
  std::vector<FolderEntry> entries;
  while (const dirent* entry = NextEntry(folder.get())) {
    struct stat status = {};
    const int result = RetryOnInterrupt([&] {
      return ::fstatat(::dirfd(folder.get()), entry->d_name, &status, AT_SYMLINK_NOFOLLOW);
    });
    if (result == 0 && (S_ISREG(status.st_mode) || S_ISDIR(status.st_mode))) {
      entries.push_back({entry->d_name, static_cast<uint64_t>(status.st_size),
                         AttributesFromMode(status.st_mode)});
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
