#pragma once

#include <string>

#include "history/locations.h"
#include "platform/path.h"
#include "tests/support/fake_machine.h"
#include "tests/support/scratch_folder.h"

// A scratch folder that is the common application data folder of a new fake machine.
struct ScratchHistory : ScratchFolder {
  ScratchHistory() {
    Machine() = FakeMachine();
    Machine().CommonFolder = Root;
  }
};

// The full path of one below the history folder, which is written with slashes.
inline std::string InHistory(const std::string& path) {
  return JoinPath(GetHistoryDir(), Replaced(path, "/", {kPathSeparator}));
}
