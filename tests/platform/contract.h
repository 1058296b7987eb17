#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <string>

#include "platform/path.h"
#include "platform/profile_file.h"
#include "tests/support/scratch_folder.h"

// The tests of this folder check the contracts of the headers in platform/ on every system. Where
// the contract differs between systems, so does the expected value.

namespace fs = std::filesystem;
using namespace std::string_literals;

inline const bool isWindows = kPathSeparator == '\\';
inline const std::string device = isWindows ? "NUL" : "/dev/null";

// A test that has a scratch folder.
class Platform : public testing::Test, protected ScratchFolder {};

// A test that has a profile file with one value.
class ProfileFile : public Platform {
 protected:
  std::string Value(const std::string& key = "Key") const {
    return ReadProfileValue(Ini, "S", key, "none", 256);
  }

  const std::string Ini = Make("a.ini", "[S]\nKey=old\n");
};

// Writes twice while another owner holds the lock: only the first write waits, for 60 ms.
inline void ExpectOneWaitForTheLock(const std::string& ini) {
  using std::chrono::steady_clock;
  const std::chrono::milliseconds limit(60);
  LimitProfileLockTime(limit);
  const auto begin = steady_clock::now();
  EXPECT_TRUE(WriteProfileValue(ini, "S", "Key", "first"));
  const auto middle = steady_clock::now();
  EXPECT_TRUE(WriteProfileValue(ini, "S", "Key", "second"));
  EXPECT_LT(steady_clock::now() - middle, limit);
  EXPECT_GE(middle - begin, limit);
  EXPECT_LT(middle - begin, std::chrono::seconds(5));
  EXPECT_EQ(ReadProfileValue(ini, "S", "Key", "none", 256), "second");
}
