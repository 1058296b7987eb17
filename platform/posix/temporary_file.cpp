#include "platform/temporary_file.h"

#include <fcntl.h>

#include "platform/posix/file_calls.h"
#include "platform/temporary_path.h"

TemporaryFile::TemporaryFile(const std::string& target) : Target(target) {
  for (int attempt = 0; attempt < 8; ++attempt) {
    const std::string path = RandomPathBeside(target);
    if (CreateNew(path, /*mode=*/0600).IsOpen()) {
      Name = path;
      return;
    }
    if (errno != EEXIST) {
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
  struct stat status = {};
  return StatusOf(path, Links::kNoFollow, status) ? S_ISREG(status.st_mode) : errno == ENOENT;
}

bool TemporaryFile::Replace() {
  const Descriptor file = OpenFile(Name, O_RDONLY | O_NOFOLLOW);
  if (!file.IsOpen() || !FlushToDisk(file) || !IsReplaceable(Target) || !RenameOver(Name, Target)) {
    return false;
  }
  Name.clear();
  return true;
}

bool TemporaryFile::MoveToNew() {
  if (!Exists() || !RenameToNew(Name, Target)) {
    return false;
  }
  Name.clear();
  return true;
}
