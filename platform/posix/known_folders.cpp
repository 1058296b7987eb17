#include "platform/known_folders.h"

#include <cstdlib>

#include "platform/path.h"

std::string GetFolderPath(int32_t csidl) {
  if (csidl != kCommonAppDataFolder) {
    return "";
  }
  const char* folder = std::getenv("ORX_COMMON_APPDATA");
  // Absolute, as the history file stores paths below it, which must not depend on the working
  // directory of a later run.
  return AbsolutePath(folder == nullptr ? "" : folder).value_or("/var/lib");
}
