#pragma once

#include <string>

#include "tests/support/scratch_folder.h"

// A scratch folder that is the common application data folder of a new fake machine.
class ScratchHistory : public ScratchFolder {
 public:
  ScratchHistory();
  ~ScratchHistory();
  ScratchHistory(const ScratchHistory&) = delete;
  ScratchHistory& operator=(const ScratchHistory&) = delete;
};

// A path, given with slashes, below the history folder.
std::string InHistory(const std::string& path);
