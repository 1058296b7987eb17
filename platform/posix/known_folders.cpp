#include "platform/known_folders.h"

#include <cstdlib>

#include "platform/path.h"

std::string GetFolderPath(int32_t csidl) {
  if (csidl != kCommonAppDataFolder) {
    return "";
  }
  const char* folder = std::getenv("ORX_COMMON_APPDATA");
  // Absolute, as the paths that the history file keeps must lead to the same place in every run.
  return AbsolutePath(folder == nullptr ? "" : folder).value_or("/var/lib");
}
