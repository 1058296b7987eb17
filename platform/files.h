#pragma once

#include <string>

// Single operations on files and folders. A failure is a false or kNone, without a reason.

enum class FileKind {
  kNone,    // nothing of that name, or its status cannot be read
  kFile,    // a regular file
  kFolder,  // a folder
  kOther,   // a device, a pipe, a socket
};

// The kind of the file at the path; of a symbolic link, that of its target.
// Windows: CreateFileA and GetFileInformationByHandle, else GetFileAttributesA. POSIX: stat.
FileKind KindOf(const std::string& path);

// True if the last part of the path is a symbolic link or, on Windows, a junction. False if nothing
// of that name exists.
// Windows: FindFirstFileA. POSIX: lstat.
bool IsSymbolicLink(const std::string& path);

// True if both paths lead to the same existing file or folder: in another spelling, through a link,
// by another hard link.
// Windows: CreateFileA, GetFileInformationByHandle (volume and file index); false for a device.
// POSIX: stat (device and inode).
bool IsSameFile(const std::string& first, const std::string& second);

// Makes one folder; its parent must exist. False if anything of that name exists.
// Windows: CreateDirectoryA with default security, which the parent folder prescribes. POSIX: mkdir
// with mode 0777.
bool CreateFolder(const std::string& path);

// Moves a folder with its contents in one step. False, with nothing moved, if anything of the
// target's name exists (an empty folder too), or the source is not a folder or is a link to one.
// Windows: MoveFileA; a folder with a file in use is waited for, up to 0.2 seconds. POSIX:
// renameat2 with RENAME_NOREPLACE; on a file system without that flag, an empty folder that is
// created at the same moment can be replaced.
bool MoveFolder(const std::string& source, const std::string& target);

// Copies a regular file to a name that nothing has yet, with its last-write time and permissions
// (Windows: attributes) where the file system can. A source that grows is copied up to the size
// that it had when it was opened. The target appears complete or not at all: it is a TemporaryFile
// until then. False if anything of the target's name exists (a dangling link too) or the contents
// cannot be copied.
// Windows: ReadFile, WriteFile, SetFileTime, SetFileAttributesA; a source that is in use is waited
// for, up to 0.2 seconds. POSIX: sendfile, fchmod, futimens.
//
// The source is opened with the rights of the owner of the file "trusted", where they are less than
// those of this process: a path that is written into the trusted file leads to no file that its
// owner may not read. POSIX: setfsuid, setfsgid and setgroups, if the process is root's. Windows:
// not done; there the access list that the trusted file inherits must keep others from writing it.
bool CopyToNewFile(const std::string& source, const std::string& target,
                   const std::string& trusted);
