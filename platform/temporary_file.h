#pragma once

#include <string>

// A file that is written under a temporary name and then renamed to its target in one step, so that
// no reader sees half of it. The constructor creates it empty, in the folder of its target, with
// an unused name from RandomPathBeside. Only its owner may read it (POSIX: mode 0600; Windows: the
// security that new files inherit from the folder). The destructor removes it unless it was
// renamed. A killed process leaves it under its temporary name, which begins with a dot.
class TemporaryFile {
 public:
  explicit TemporaryFile(const std::string& target);
  ~TemporaryFile();
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;

  // False if the file could not be created; then both operations below return false.
  bool Exists() const { return !Name.empty(); }

  // The path to write to; close what was opened there before one of the operations below.
  const std::string& Path() const { return Name; }

  // Forces the data to the disk, as far as the file system can, and renames the file over its
  // target. False, with the target as it was, if the target exists and is not a regular file (a
  // link to one is none), or if any step fails.
  // Windows: FlushFileBuffers, MoveFileExA; a target that is in use is waited for, up to half a
  // second. POSIX: fdatasync, rename.
  bool Replace();

  // Renames the file to its target if nothing of that name exists (a dangling link is something).
  // Windows: MoveFileA; a file that is in use is waited for, up to 0.2 seconds. POSIX: renameat2
  // with RENAME_NOREPLACE; on a file system without that flag a target that is created at the same
  // moment can be replaced.
  bool MoveToNew();

 private:
  std::string Target;
  std::string Name;  // empty without a file
};
