#include "platform/temporary_file.h"

#include "platform/files.h"
#include "platform/temporary_path.h"
#include "platform/windows/file_entry.h"
#include "platform/windows/file_handle.h"
#include "platform/windows/file_replacement.h"
#include "platform/windows/patience.h"

TemporaryFile::TemporaryFile(const std::string& target) : Target(target) {
  for (int attempt = 0; attempt < 8; ++attempt) {
    const std::string path = RandomPathBeside(target);
    if (CreateNew(path)) {
      Name = path;
      return;
    }
    if (::GetLastError() != ERROR_FILE_EXISTS) {
      return;
    }
  }
}

TemporaryFile::~TemporaryFile() {
  if (Exists()) {
    RemoveFile(Name);
  }
}

static bool IsReplaceable(const std::string& path) {
  const FileKind kind = KindOf(path);
  return kind == FileKind::kNone || (kind == FileKind::kFile && !IsSymbolicLink(path));
}

bool TemporaryFile::Replace() {
  if (!Exists() || !FlushToDisk(Name) || !IsReplaceable(Target) || !RenameOver(Name, Target)) {
    return false;
  }
  Name.clear();
  return true;
}

bool TemporaryFile::MoveToNew() {
  const bool isMoved = Exists() && CallWithPatience(kShortPatience, AccessDenied::kIsFinal, [this] {
                         return ::MoveFileA(Name.c_str(), Target.c_str()) != FALSE;
                       });
  if (isMoved) {
    Name.clear();
  }
  return isMoved;
}
