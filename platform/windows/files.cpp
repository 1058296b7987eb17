#include "platform/files.h"

#include <algorithm>
#include <cstdint>

#include "platform/temporary_file.h"
#include "platform/windows/file_entry.h"
#include "platform/windows/file_replacement.h"
#include "platform/windows/patience.h"

// Empty for what has no identity, as a device. The query needs no access rights; a folder can only
// be opened with the flag for backups.
static std::optional<BY_HANDLE_FILE_INFORMATION> IdentityOf(const std::string& path) {
  const UniqueHandle file = OwnIfValid(::CreateFileA(
      path.c_str(), /*dwDesiredAccess=*/0, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
      /*lpSecurityAttributes=*/nullptr, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS,
      /*hTemplateFile=*/nullptr));
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
         CallWithPatience(10, AccessDenied::kMayPass,
                          [&] { return ::MoveFileA(source.c_str(), target.c_str()) != FALSE; });
}

static bool CopyBytes(HANDLE source, uint64_t size, HANDLE target) {
  char buffer[65536];
  while (size > 0) {
    const auto most = static_cast<DWORD>(std::min<uint64_t>(size, sizeof buffer));
    DWORD count = 0;
    DWORD written = 0;
    if (::ReadFile(source, buffer, most, &count, /*lpOverlapped=*/nullptr) == FALSE ||
        ::WriteFile(target, buffer, count, &written, /*lpOverlapped=*/nullptr) == FALSE ||
        written != count) {
      return false;
    }
    if (count == 0) {
      break;
    }
    size -= count;
  }
  return true;
}

static UniqueHandle OpenSource(const std::string& path) {
  UniqueHandle file;
  CallWithPatience(10, AccessDenied::kIsFinal, [&] {
    file = OpenShared(path, GENERIC_READ);
    return file != nullptr;
  });
  return file;
}

// Not CopyFileA, which goes on while the source grows.
static bool CopyContents(const std::string& source, const std::string& target) {
  const UniqueHandle from = OpenSource(source);
  const UniqueHandle to = OpenShared(target, GENERIC_WRITE);
  BY_HANDLE_FILE_INFORMATION status = {};
  if (!from || !to || ::GetFileType(from.get()) != FILE_TYPE_DISK ||
      ::GetFileInformationByHandle(from.get(), &status) == FALSE) {
    return false;
  }
  const uint64_t size = uint64_t{status.nFileSizeHigh} << 32 | status.nFileSizeLow;
  if (!CopyBytes(from.get(), size, to.get())) {
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
