#pragma once

#include <cstdint>
#include <string>

// The path of one of the system's own folders, by its CSIDL number; empty if the system does not
// know it. No separator at its end.
// Windows: SHGetFolderPathA of shfolder.dll, looked up at run time. POSIX: for 35, the common
// application data folder, what ORX_COMMON_APPDATA holds, else /var/lib; empty for others.
std::string GetFolderPath(int32_t csidl);
