#include "platform/known_folders.h"

#include <cstdlib>

std::string GetFolderPath(int32_t csidl) {
  constexpr int32_t commonAppData = 35;
  if (csidl != commonAppData) {
    return "";
  }
  const char* folder = std::getenv("ORX_COMMON_APPDATA");
  return folder != nullptr && *folder != '\0' ? folder : "/var/lib";
}
