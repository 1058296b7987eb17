#pragma once

#include <gtest/gtest.h>

#include <string>

#include "platform/path.h"
#include "tests/support/scratch_folder.h"

// The tests of this folder check what a header of platform/ promises, with the implementation of
// this build, on every system. Where systems differ by contract, the case says so.

inline const bool isWindows = kPathSeparator == '\\';
inline const std::string device = isWindows ? "NUL" : "/dev/null";

// A test that has a scratch folder.
class Platform : public testing::Test, protected ScratchFolder {};
