#pragma once

#include <string>

#include "tests/support/scratch_folder.h"

// A scratch folder that is the common application data folder of a new fake machine.
struct ScratchHistory : ScratchFolder {
  ScratchHistory();
};

// The full path of one below the history folder, which is written with slashes.
std::string InHistory(const std::string& path);
