#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

// The contents of a folder, and the properties of a file or folder that an archive keeps.

// The bit of an attribute word that marks a folder.
inline constexpr uint32_t kFolderAttribute = 0x10;

struct FolderEntry {
  std::string Name;         // without its folder
  uint64_t Size = 0;        // of a file, in bytes
  uint32_t Attributes = 0;  // as FileAttributes returns them
};

// A local time in calendar fields; all zero for none.
struct CalendarTime {
  int Year = 0;   // all four digits
  int Month = 0;  // 1 to 12
  int Day = 0;
  int Hour = 0;
  int Minute = 0;
  int Second = 0;
};

// The files and folders directly in a folder; "." and ".." can be among them. Symbolic links,
// junctions, and what is neither a file nor a folder are left out. Empty for a folder that cannot
// be read. Order: the system's on Windows, byte order of the names on POSIX.
// Windows: FindFirstFileA and FindNextFileA with "*.*". POSIX: readdir, fstatat.
std::vector<FolderEntry> ListFolder(const std::string& path);

// The attribute word of a file or folder; nothing if there is none of that name. On POSIX it is
// kFolderAttribute for a folder, 0x1 (read-only) for a file without any write permission, and 0x80
// (normal) for any other; of a symbolic link it describes the link.
// Windows: GetFileAttributesA. POSIX: lstat.
std::optional<uint32_t> FileAttributes(const std::string& path);

// The last-write time of a file or folder; nothing if there is none of that name or the system
// cannot convert the time.
// Windows: FindFirstFileA, FileTimeToLocalFileTime, FileTimeToSystemTime. POSIX: lstat,
// localtime_r.
std::optional<CalendarTime> LastWriteTime(const std::string& path);
