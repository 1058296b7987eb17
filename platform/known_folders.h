#pragma once

#include <cstdint>
#include <string>

// The CSIDL number of the common application data folder.
inline constexpr int32_t kCommonAppDataFolder = 35;

// The path of one of the system's own folders, by its CSIDL number; empty if the system does not
// know it. On Windows it has no separator at its end, unless it is a drive's root; on POSIX it is
// what the environment holds.
// Windows: SHGetFolderPathA of shfolder.dll, looked up at run time. POSIX: for kCommonAppDataFolder
// the value of ORX_COMMON_APPDATA, else /var/lib; empty for others.
std::string GetFolderPath(int32_t csidl);
