#include "platform/known_folders.h"

#include <cstdlib>

#include "tests/platform/contract.h"

namespace {

TEST(KnownFolders, HaveACommonOneForApplicationData) {
  const char* variable = std::getenv("ORX_COMMON_APPDATA");
  const std::string before = variable == nullptr ? "" : variable;
  ::putenv(const_cast<char*>("ORX_COMMON_APPDATA="));  // on Windows it is none of the system's
  const std::string folder = GetFolderPath(kCommonAppDataFolder);
  EXPECT_TRUE(std::filesystem::is_directory(folder)) << folder;
  EXPECT_TRUE(isWindows || folder == "/var/lib") << folder;
  EXPECT_EQ(GetFolderPath(/*csidl=*/9999), "");
  static std::string restored = "ORX_COMMON_APPDATA=" + before;
  ::putenv(restored.data());
}

}  // namespace
