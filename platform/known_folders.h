#pragma once

#include <cstdint>
#include <string>

// The CSIDL number of the common application data folder.
inline constexpr int32_t kCommonAppDataFolder = 35;

// The path of one of the system's own folders, by its CSIDL number; empty if the system does not
// know it.
// Windows: SHGetFolderPathA of shfolder.dll, looked up at run time; no separator at its end, unless
// it is a drive's root. POSIX: for kCommonAppDataFolder the value of ORX_COMMON_APPDATA, made
// absolute (AbsolutePath), else /var/lib; empty for others.
std::string GetFolderPath(int32_t csidl);
