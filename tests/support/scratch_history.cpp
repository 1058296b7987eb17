#include "tests/support/scratch_history.h"

#include "history/locations.h"
#include "platform/path.h"
#include "tests/support/fake_machine.h"

ScratchHistory::ScratchHistory() {
  Machine() = FakeMachine();
  Machine().CommonFolder = Root;
}

std::string InHistory(const std::string& path) {
  return JoinPath(GetHistoryDir(), Replaced(path, "/", {kPathSeparator}));
}
