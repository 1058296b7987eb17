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

// The full path of one below the history folder, which is written with slashes.
std::string InHistory(const std::string& path);
