#include "platform/temporary_file.h"

#include "platform/files.h"
#include "platform/temporary_path.h"
#include "platform/windows/file_entry.h"
#include "platform/windows/file_replacement.h"
#include "platform/windows/patience.h"

TemporaryFile::TemporaryFile(const std::string& target) : Target(target) {
  for (int attempt = 0; attempt < 8; ++attempt) {
    const std::string path = RandomPathBeside(target);
    const UniqueHandle file = OwnIfValid(::CreateFileA(
        path.c_str(), GENERIC_WRITE, /*dwShareMode=*/0, /*lpSecurityAttributes=*/nullptr,
        CREATE_NEW, FILE_ATTRIBUTE_NORMAL, /*hTemplateFile=*/nullptr));
    if (file) {
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
  const bool isMoved = Exists() && CallWithPatience(10, AccessDenied::kIsFinal, [this] {
                         return ::MoveFileA(Name.c_str(), Target.c_str()) != FALSE;
                       });
  if (isMoved) {
    Name.clear();
  }
  return isMoved;
}
