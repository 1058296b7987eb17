#include "platform/exclusive_file.h"

#include <gtest/gtest.h>

#include "tests/platform/contract.h"

namespace {

using namespace std::string_literals;
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
  for (const std::string& other : {Root, In("none"), device}) {
    ExclusiveFile file(other);
    char byte = 0;
    EXPECT_FALSE(file.IsOpen()) << other;
    EXPECT_EQ(file.Read(&byte, 1), 0U) << other;
  }
}

}  // namespace
