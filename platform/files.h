#pragma once

#include <string>

// Single operations on files and folders. A failure is a false or a "none", without a reason.

enum class FileKind {
  kNone,    // nothing of that name, or its status cannot be read
  kFile,    // a regular file
  kFolder,  // a folder
  kOther,   // a device, a pipe, a socket
};

// What stands at the path. A symbolic link counts as what it leads to.
// Windows: _stat. POSIX: stat.
FileKind KindOf(const std::string& path);

// True if the last part of the path is a link to another place: a symbolic link, on Windows also a
// junction. False if there is nothing of that name.
bool IsSymbolicLink(const std::string& path);

// True if both paths lead to one and the same existing file, whatever their spelling.
bool IsSameFile(const std::string& first, const std::string& second);

// Makes one folder; the folder above it must exist. False if anything of that name exists.
// Windows: CreateDirectoryA with default security. POSIX: mkdir.
bool CreateFolder(const std::string& path);

// Moves a folder with all it holds in one step. False, with nothing moved, if anything of the
// target's name exists (an empty folder too) or the source does not.
// Windows: MoveFileA. POSIX: renameat2 with RENAME_NOREPLACE.
bool MoveFolder(const std::string& source, const std::string& target);

// Copies a file to a name that nothing has yet, and keeps its last-write time. The target comes
// into being whole or not at all; while it grows it has a name that begins with a dot. False if
// anything of the target's name exists (a dangling link too) or any step fails.
// Windows: CopyFileA, refusing an existing target. POSIX: copy_file_range beside it, then link.
bool CopyToNewFile(const std::string& source, const std::string& target);
