#include "app/install_history.h"

#include <iostream>

#include "app/install_event.h"
#include "history/ini_file.h"
#include "history/locations.h"
#include "platform/profile_file.h"

CInstallHistory::CInstallHistory() { ReadCount(); }

int CInstallHistory::Run(int argc, char** argv) {
  // Until the start keys are written, so that a start replaces the history file once.
  auto guard = std::make_shared<const ProfileGuard>(GetHistoryFilePath());
  if (!InitHistoryStore()) {
    std::cout << "Initialiation Failed:" << std::endl;
    return 1;
  }
  CInstallEvent event = RegisterEvent(argc, argv);
  if (!event.Valid) {
    return 2;
  }
  if (event.Mode == "-start") {
    event.StartGuard = guard;
  }
  guard.reset();
  event.Dispatch();
  return 0;
}

bool CInstallHistory::InitHistoryStore() {
  std::string failed;
  if (!EnsureHistoryDir(failed)) {
    if (failed == GetHistoryDir()) {
      std::cout << " Failed to create path:" << failed;
    }
    return false;
  }
  // On a first run Run's guard could not lock the folder. Without this one, another run could count
  // its event now, and the reset would undo that.
  const ProfileGuard guard(GetHistoryFilePath());
  // A file that exists but whose status cannot be read must keep its count.
  const CIniFile history(GetHistoryFilePath());
  if (!FileExists(history.Path) && history.ReadString("History", "Count", "", 2).empty()) {
    ResetCount();
  }
  return true;
}

CInstallEvent CInstallHistory::RegisterEvent(int argc, char** argv) {
  ReadCount();  // again: other runs may have counted since the constructor
  CInstallEvent event(argc, argv);
  if (event.Valid && event.Mode == "-start") {
    // Unsigned, as a file edited by hand may have the highest number.
    EventCount = static_cast<int32_t>(static_cast<uint32_t>(EventCount) + 1);
    WriteCount(EventCount);
  }
  return event;
}

void CInstallHistory::ReadCount() {
  EventCount = CIniFile(GetHistoryFilePath()).ReadInt("History", "Count", 0);
}

void CInstallHistory::WriteCount(int32_t count) {
  CIniFile(GetHistoryFilePath()).WriteString("History", "Count", std::to_string(count));
}

void CInstallHistory::ResetCount() { WriteCount(0); }
