#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <string>

#include "platform/path.h"
#include "platform/profile_file.h"
#include "tests/support/scratch_folder.h"

// The tests of this folder check what a header of platform/ promises, with the implementation of
// this build, on every system. Where systems differ by contract, the case says so.

namespace fs = std::filesystem;
using namespace std::string_literals;

inline const bool isWindows = kPathSeparator == '\\';
inline const std::string device = isWindows ? "NUL" : "/dev/null";

// A test that has a scratch folder.
class Platform : public testing::Test, protected ScratchFolder {};

// Two writes while another owner has the lock of the file: only the first one waits, for 60 ms.
inline void ExpectOneWaitForTheLock(const std::string& ini) {
  using std::chrono::steady_clock;
  const std::chrono::milliseconds limit(60);
  LimitProfileLockTime(limit);
  const auto begin = steady_clock::now();
  EXPECT_TRUE(WriteProfileValue(ini, "S", "Key", "first"));
  const auto middle = steady_clock::now();
  EXPECT_TRUE(WriteProfileValue(ini, "S", "Key", "second"));
  EXPECT_GE(middle - begin, limit);
  EXPECT_LT(middle - begin, std::chrono::seconds(5));
  EXPECT_LT(steady_clock::now() - middle, limit);
  EXPECT_EQ(ReadProfileValue(ini, "S", "Key", "none", 256), "second");
}
