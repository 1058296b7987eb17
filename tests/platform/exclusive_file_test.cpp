#include "platform/exclusive_file.h"

#include <fstream>

#include "tests/platform/contract.h"

namespace {

using Files = Platform;

TEST_F(Files, AreReadExclusively) {
  const std::string bytes = "line\r\n\x1A\0"s + std::string(5000, 'b');
  const std::string path = Make("file", bytes);
  {
    ExclusiveFile file(path);
    char buffer[6000];
    const size_t first = file.Read(buffer, 9);
    const size_t rest = file.Read(buffer + first, sizeof buffer - first);
    EXPECT_EQ(std::string(buffer, first + rest), bytes);
    EXPECT_EQ(ExclusiveFile(path).IsOpen(), !isWindows);
  }
  EXPECT_TRUE(ExclusiveFile(path).IsOpen());
  std::error_code error;
  fs::create_symlink(path, In("link"), error);  // not possible everywhere
  for (const std::string& other : {Root, In("none"), In("link"), device}) {
    ExclusiveFile file(other);
    char byte = 0;
    EXPECT_FALSE(file.IsOpen() || file.Read(&byte, 1) > 0 || file.Size() > 0) << other;
  }
}

TEST_F(Files, EndWhereTheyEndedWhenTheyWereOpened) {
  const std::string path = Make("file", "0123456789");
  ExclusiveFile file(path);
  std::ofstream(path, std::ios::app) << "more";  // impossible on Windows
  char buffer[20];
  EXPECT_EQ(file.Size(), 10U);
  EXPECT_EQ(file.Read(buffer, 4), 4U);
  EXPECT_EQ(file.Read(buffer, sizeof buffer), 6U);
  EXPECT_EQ(std::string(buffer, 6), "456789");
  EXPECT_EQ(file.Read(buffer, sizeof buffer), 0U);
}

}  // namespace
