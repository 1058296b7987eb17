#pragma once

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <string>

#include "platform/posix/descriptor.h"

// System calls that several files here need, repeated while a signal interrupts them. They return
// false, with the reason in errno, if a call fails.

// Opens a file that no other program inherits; not open (IsOpen), with the reason in errno, if that
// fails. The mode is that of a new file.
inline Descriptor OpenFile(const std::string& path, int flags, mode_t mode = 0) {
  return Descriptor(
      RetryOnInterrupt([&] { return ::open(path.c_str(), flags | O_CLOEXEC, mode); }));
}

// Creates a file, for reading and writing, under a name that nothing has, not even a link.
inline Descriptor CreateNew(const std::string& path, mode_t mode) {
  return OpenFile(path, O_RDWR | O_CREAT | O_EXCL, mode);
}

enum class Links { kFollow, kNoFollow };

// The status of the file at the path; with kNoFollow that of a symbolic link itself.
inline bool StatusOf(const std::string& path, Links links, struct stat& status) {
  const int flags = links == Links::kNoFollow ? AT_SYMLINK_NOFOLLOW : 0;
  return RetryOnInterrupt([&] { return ::fstatat(AT_FDCWD, path.c_str(), &status, flags); }) == 0;
}

inline bool StatusOf(const Descriptor& file, struct stat& status) {
  return RetryOnInterrupt([&] { return ::fstat(file.Get(), &status); }) == 0;
}

// Opens a regular file for reading and returns its status too. Anything else is not opened
// (EINVAL), and the attempt does not wait, as without O_NONBLOCK it would for the writer of a pipe.
inline Descriptor OpenRegularFile(const std::string& path, Links links, struct stat& status) {
  const int linkFlag = links == Links::kNoFollow ? O_NOFOLLOW : 0;
  Descriptor file = OpenFile(path, O_RDONLY | O_NONBLOCK | linkFlag);
  if (file.IsOpen() && (!StatusOf(file, status) || !S_ISREG(status.st_mode))) {
    file.Reset(-1);
    errno = EINVAL;
  }
  return file;
}

inline bool RenameOver(const std::string& source, const std::string& target) {
  return RetryOnInterrupt([&] { return ::rename(source.c_str(), target.c_str()); }) == 0;
}

// Renames to a name that nothing has.
bool RenameToNew(const std::string& source, const std::string& target);

inline bool RemoveFile(const std::string& path) {
  return RetryOnInterrupt([&] { return ::unlink(path.c_str()); }) == 0;
}

// Forces the data of a file to the disk. True also on a file system that cannot do that.
inline bool FlushToDisk(const Descriptor& file) {
  return RetryOnInterrupt([&] { return ::fdatasync(file.Get()); }) == 0 || errno == EINVAL ||
         errno == ENOTSUP || errno == ENOSYS || errno == EROFS;
}
