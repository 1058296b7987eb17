#include "platform/files.h"

#include <fcntl.h>
#include <sys/sendfile.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>

#include "platform/posix/descriptor.h"
#include "platform/posix/file_calls.h"
#include "platform/posix/owner_rights.h"
#include "platform/temporary_file.h"

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
  return StatusOf(path, Links::kNoFollow, status) && S_ISLNK(status.st_mode);
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

bool RenameToNew(const std::string& source, const std::string& target) {
  const int result = RetryOnInterrupt([&] {
    return ::renameat2(AT_FDCWD, source.c_str(), AT_FDCWD, target.c_str(), RENAME_NOREPLACE);
  });
  if (result == 0) {
    return true;
  }
  if (errno != EINVAL && errno != ENOSYS) {
    return false;
  }
  // The file system does not know that flag. A file or an empty folder that is created between
  // these two calls is lost.
  struct stat status = {};
  return !StatusOf(target, Links::kNoFollow, status) && errno == ENOENT &&
         RenameOver(source, target);
}

bool MoveFolder(const std::string& source, const std::string& target) {
  struct stat status = {};
  return StatusOf(source, Links::kNoFollow, status) && S_ISDIR(status.st_mode) &&
         RenameToNew(source, target);
}

// Copies the bytes that the source has by its status, or fewer if it is cut meanwhile, and then its
// last-write time and permissions, where the file system can.
static bool CopyContents(const Descriptor& source, const struct stat& status,
                         const Descriptor& target) {
  constexpr off_t most = 1 << 30;
  for (off_t rest = status.st_size; rest > 0;) {
    const ssize_t count = RetryOnInterrupt([&] {
      return ::sendfile(target.Get(), source.Get(), /*offset=*/nullptr,
                        static_cast<size_t>(std::min(rest, most)));
    });
    if (count < 0) {
      return false;
    }
    if (count == 0) {
      break;
    }
    rest -= count;
  }
  const timespec times[] = {status.st_atim, status.st_mtim};
  RetryOnInterrupt([&] { return ::fchmod(target.Get(), status.st_mode & 0777); });
  RetryOnInterrupt([&] { return ::futimens(target.Get(), times); });
  return true;
}

static Descriptor OpenSource(const std::string& source, const std::string& trusted,
                             struct stat& status) {
  const OwnerRights rights(trusted);
  return OpenRegularFile(source, Links::kFollow, status);
}

bool CopyToNewFile(const std::string& source, const std::string& target,
                   const std::string& trusted) {
  struct stat status = {};
  const Descriptor from = OpenSource(source, trusted, status);
  if (!from.IsOpen()) {
    return false;
  }
  TemporaryFile copy(target);
  const Descriptor to = OpenFile(copy.Path(), O_WRONLY | O_NOFOLLOW);
  return to.IsOpen() && CopyContents(from, status, to) && copy.MoveToNew();
}
