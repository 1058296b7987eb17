#include "platform/files.h"

#include <sys/stat.h>

#include "platform/path.h"
#include "platform/windows/file_entry.h"
#include "platform/windows/system.h"

// Nothing for what has none, as a device. Zero access is enough to ask for it; a folder needs the
// flag for backups.
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

FileKind KindOf(const std::string& path) {
  struct _stat64 status = {};
  if (::_stat64(path.c_str(), &status) != 0) {
    return FileKind::kNone;
  }
  const int kind = status.st_mode & _S_IFMT;
  if (kind == _S_IFDIR) {
    return FileKind::kFolder;
  }
  // The status of a name like "CON" can be that of a file.
  return kind == _S_IFREG && IdentityOf(path) ? FileKind::kFile : FileKind::kOther;
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
         ::MoveFileA(source.c_str(), target.c_str()) != FALSE;
}

bool CopyToNewFile(const std::string& source, const std::string& target) {
  const std::string growing =
      FolderPart(target) + ".copy-" + std::to_string(::GetCurrentProcessId()) + ".tmp";
  RemoveFile(growing);  // of a killed process that had the same ID
  if (::CopyFileA(source.c_str(), growing.c_str(), /*bFailIfExists=*/1) != FALSE &&
      ::MoveFileA(growing.c_str(), target.c_str()) != FALSE) {
    return true;
  }
  RemoveFile(growing);
  return false;
}
