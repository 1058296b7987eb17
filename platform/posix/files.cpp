#include "platform/files.h"

#include <fcntl.h>
#include <sys/sendfile.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>

#include "platform/path.h"
#include "platform/posix/descriptor.h"
#include "platform/posix/file_calls.h"

FileKind KindOf(const std::string& path) {
  struct stat status = {};
  if (!StatusOf(path, Links::kFollow, status)) {
    return FileKind::kNone;
  }
  return S_ISREG(status.st_mode)   ? FileKind::kFile
         : S_ISDIR(status.st_mode) ? FileKind::kFolder
                                   : FileKind::kOther;
}

bool IsSymbolicLink(const std::string& path) {
  struct stat status = {};
  return StatusOf(path, Links::kTell, status) && S_ISLNK(status.st_mode);
}

bool IsSameFile(const std::string& first, const std::string& second) {
  struct stat a = {};
  struct stat b = {};
  return StatusOf(first, Links::kFollow, a) && StatusOf(second, Links::kFollow, b) &&
         a.st_dev == b.st_dev && a.st_ino == b.st_ino;
}

bool CreateFolder(const std::string& path) {
  return RetryOnInterrupt([&] { return ::mkdir(path.c_str(), 0777); }) == 0;
}

// Renames only to a name that nothing has.
static bool RenameToNew(const std::string& source, const std::string& target) {
  const int result = RetryOnInterrupt([&] {
    return ::renameat2(AT_FDCWD, source.c_str(), AT_FDCWD, target.c_str(), RENAME_NOREPLACE);
  });
  if (result == 0) {
    return true;
  }
  if (errno != EINVAL && errno != ENOSYS) {
    return false;
  }
  // A file system without that flag: what comes into being between the look and the renaming can
  // be lost if it is an empty folder or a file.
  struct stat status = {};
  return !StatusOf(target, Links::kTell, status) && errno == ENOENT && RenameOver(source, target);
}

bool MoveFolder(const std::string& source, const std::string& target) {
  struct stat status = {};
  return StatusOf(source, Links::kTell, status) && S_ISDIR(status.st_mode) &&
         RenameToNew(source, target);
}

// Copies all bytes, the last-write time and the permissions.
static bool CopyContents(const Descriptor& source, const Descriptor& target,
                         const struct stat& status) {
  constexpr size_t most = 1 << 30;
  for (;;) {
    const ssize_t count = RetryOnInterrupt(
        [&] { return ::sendfile(target.Get(), source.Get(), /*offset=*/nullptr, most); });
    if (count < 0) {
      return false;
    }
    if (count == 0) {
      break;
    }
  }
  const timespec times[] = {status.st_atim, status.st_mtim};
  return RetryOnInterrupt([&] { return ::fchmod(target.Get(), status.st_mode & 0777); }) == 0 &&
         RetryOnInterrupt([&] { return ::futimens(target.Get(), times); }) == 0;
}

bool CopyToNewFile(const std::string& source, const std::string& target) {
  // Without O_NONBLOCK the opening of a pipe would wait for its writer.
  const Descriptor from(
      RetryOnInterrupt([&] { return ::open(source.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC); }));
  struct stat status = {};
  if (!from.IsOpen() || !StatusOf(from, status) || !S_ISREG(status.st_mode)) {
    return false;
  }
  const std::string folder = FolderPart(target);
  const std::string growing = folder + ".copy-" + std::to_string(::getpid()) + ".tmp";
  RemoveFile(growing);  // of a killed process that had the same ID
  const Descriptor to(RetryOnInterrupt(
      [&] { return ::open(growing.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600); }));
  if (!to.IsOpen()) {
    return false;
  }
  if (CopyContents(from, to, status) && RenameToNew(growing, target)) {
    return true;
  }
  RemoveFile(growing);
  return false;
}
