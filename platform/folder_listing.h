#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

// What a folder holds, and the properties that an archive keeps of each thing.

// The bit of an attribute word that marks a folder.
inline constexpr uint32_t kFolderAttribute = 0x10;

struct FolderEntry {
  std::string Name;         // without its folder
  uint64_t Size = 0;        // of a file, in bytes
  uint32_t Attributes = 0;  // as FileAttributes gives them
};

// A moment in calendar fields, local time; all zero where there is none.
struct CalendarTime {
  int Year = 0;   // all four digits
  int Month = 0;  // 1 to 12
  int Day = 0;
  int Hour = 0;
  int Minute = 0;
  int Second = 0;
};

// The files and folders directly in a folder, "." and ".." perhaps among them. Symbolic links (and
// junctions) are left out, and so is what is neither file nor folder. Empty for a folder that
// cannot be read. Order: the system's on Windows, byte order of the names on POSIX.
// Windows: FindFirstFileA with "*.*". POSIX: readdir, fstatat.
std::vector<FolderEntry> ListFolder(const std::string& path);

// The attribute word of a file or folder; nothing if there is none of that name. On POSIX the word
// has kFolderAttribute for a folder, 0x80 (plain) for a writable file and 0x1 (read-only) for a
// file without any write permission.
// Windows: GetFileAttributesA. POSIX: lstat.
std::optional<uint32_t> FileAttributes(const std::string& path);

// The last-write time of a file or folder; nothing if there is none of that name.
// Windows: FindFirstFileA, FileTimeToLocalFileTime, FileTimeToSystemTime. POSIX: lstat,
// localtime_r.
std::optional<CalendarTime> LastWriteTime(const std::string& path);
