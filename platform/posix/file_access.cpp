#include "platform/posix/file_access.h"

#include <sys/xattr.h>
#include <unistd.h>

#include <optional>
#include <string>

static constexpr const char* kAccessList = "system.posix_acl_access";

// The list in the form of the file system, empty if the file has none; nothing if it cannot be
// read.
static std::optional<std::string> AccessListOf(const Descriptor& file) {
  std::string list(65536, '\0');  // the system's own limit for an attribute
  const ssize_t size = RetryOnInterrupt(
      [&] { return ::fgetxattr(file.Get(), kAccessList, list.data(), list.size()); });
  if (size < 0) {
    return errno == ENODATA || errno == ENOTSUP ? std::optional("") : std::nullopt;
  }
  list.resize(static_cast<size_t>(size));
  return list;
}

static bool SetOwner(const Descriptor& file, uid_t user, gid_t group) {
  return RetryOnInterrupt([&] { return ::fchown(file.Get(), user, group); }) == 0;
}

// The permissions with those of the group limited to what others have.
static mode_t WithoutGroup(mode_t mode) { return (mode & ~070U) | (mode & 070 & (mode & 07) << 3); }

void CopyAccess(const Descriptor& source, const struct stat& status, const Descriptor& target) {
  // The owner first, as a change of it can clear bits of the mode. Only root may change the owner,
  // but an owner may set every group that the owner is in.
  constexpr auto sameUser = static_cast<uid_t>(-1);
  const bool keepsGroup =
      SetOwner(target, status.st_uid, status.st_gid) || SetOwner(target, sameUser, status.st_gid);
  const std::optional<std::string> list = AccessListOf(source);
  // A list inherited from the folder would take effect as soon as the mode allows it.
  RetryOnInterrupt([&] { return ::fremovexattr(target.Get(), kAccessList); });
  const mode_t mode = status.st_mode & 07777;
  const bool isPlain = keepsGroup && list && list->empty();
  RetryOnInterrupt([&] { return ::fchmod(target.Get(), isPlain ? mode : WithoutGroup(mode)); });
  if (keepsGroup && list && !list->empty()) {
    RetryOnInterrupt([&] {
      return ::fsetxattr(target.Get(), kAccessList, list->data(), list->size(), /*flags=*/0);
    });
  }
}
