#pragma once

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <string>

#include "platform/posix/descriptor.h"

// System calls that more than one file here needs, repeated as long as a signal interrupts them.
// False, with the reason in errno, if one fails.

enum class Links { kFollow, kTell };

// The status of what stands at the path. A symbolic link there counts as what it leads to, or is
// told of itself.
inline bool StatusOf(const std::string& path, Links links, struct stat& status) {
  const int flags = links == Links::kTell ? AT_SYMLINK_NOFOLLOW : 0;
  return RetryOnInterrupt([&] { return ::fstatat(AT_FDCWD, path.c_str(), &status, flags); }) == 0;
}

inline bool StatusOf(const Descriptor& file, struct stat& status) {
  return RetryOnInterrupt([&] { return ::fstat(file.Get(), &status); }) == 0;
}

inline bool RenameOver(const std::string& source, const std::string& target) {
  return RetryOnInterrupt([&] { return ::rename(source.c_str(), target.c_str()); }) == 0;
}

inline bool RemoveFile(const std::string& path) {
  return RetryOnInterrupt([&] { return ::unlink(path.c_str()); }) == 0;
}
