#include "platform/files.h"

#include <cstdint>
#include <optional>

#include "platform/temporary_file.h"
#include "platform/windows/file_entry.h"
#include "platform/windows/file_handle.h"
#include "platform/windows/patience.h"

// Empty for what has no identity, as a device. The query needs no access rights; a folder can only
// be opened with the flag for backups.
static std::optional<BY_HANDLE_FILE_INFORMATION> IdentityOf(const std::string& path) {
  const UniqueHandle file = OpenExisting(path, /*access=*/0, kShareAll, FILE_FLAG_BACKUP_SEMANTICS);
  BY_HANDLE_FILE_INFORMATION identity = {};
  if (!file || ::GetFileInformationByHandle(file.get(), &identity) == FALSE) {
    return std::nullopt;
  }
  return identity;
}

// Not _stat, which takes a second byte that equals a backslash for a separator at the end.
FileKind KindOf(const std::string& path) {
  const auto identity = IdentityOf(path);
  const DWORD attributes =
      identity ? identity->dwFileAttributes : ::GetFileAttributesA(path.c_str());
  if (attributes == INVALID_FILE_ATTRIBUTES) {
    return FileKind::kNone;
  }
  if ((attributes & FILE_ATTRIBUTE_DIRECTORY) != 0) {
    return FileKind::kFolder;
  }
  return identity ? FileKind::kFile : FileKind::kOther;  // a device has attributes too
}

bool IsSymbolicLink(const std::string& path) {
  const std::optional<WIN32_FIND_DATAA> entry = FindEntry(path);
  return entry && IsLink(*entry);
}

bool IsSameFile(const std::string& first, const std::string& second) {
  const auto a = IdentityOf(first);
  const auto b = IdentityOf(second);
  return a && b && a->dwVolumeSerialNumber == b->dwVolumeSerialNumber &&
         a->nFileIndexHigh == b->nFileIndexHigh && a->nFileIndexLow == b->nFileIndexLow;
}

bool CreateFolder(const std::string& path) {
  return ::CreateDirectoryA(path.c_str(), /*lpSecurityAttributes=*/nullptr) != FALSE;
}

static bool IsNameTaken(const std::string& path) {
  return ::GetFileAttributesA(path.c_str()) != INVALID_FILE_ATTRIBUTES;
}

bool MoveFolder(const std::string& source, const std::string& target) {
  // The system itself refuses every target but the source, in another spelling of its name.
  return KindOf(source) == FileKind::kFolder && !IsSymbolicLink(source) && !IsNameTaken(target) &&
         CallWithPatience(kShortPatience, AccessDenied::kMayPass,
                          [&] { return ::MoveFileA(source.c_str(), target.c_str()) != FALSE; });
}

// Not CopyFileA, which goes on while the source grows.
static bool CopyContents(const std::string& source, const std::string& target) {
  const UniqueHandle from = OpenPatiently(kShortPatience, source, GENERIC_READ);
  const UniqueHandle to = OpenExisting(target, GENERIC_WRITE);
  const std::optional<uint64_t> size = RegularFileSize(from);
  BY_HANDLE_FILE_INFORMATION status = {};
  if (!size || !to || ::GetFileInformationByHandle(from.get(), &status) == FALSE ||
      !CopyBytes(from, *size, to)) {
    return false;
  }
  ::SetFileTime(to.get(), /*lpCreationTime=*/nullptr, /*lpLastAccessTime=*/nullptr,
                &status.ftLastWriteTime);
  constexpr DWORD kept = FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM |
                         FILE_ATTRIBUTE_ARCHIVE;
  ::SetFileAttributesA(target.c_str(), status.dwFileAttributes & kept);
  return true;
}

bool CopyToNewFile(const std::string& source, const std::string& target,
                   const std::string& /*trusted*/) {
  TemporaryFile copy(target);
  return copy.Exists() && CopyContents(source, copy.Path()) && copy.MoveToNew();
}
