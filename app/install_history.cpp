#include "app/install_history.h"

#include <iostream>

#include "app/install_event.h"
#include "history/ini_file.h"
#include "history/locations.h"
#include "platform/path.h"
#include "platform/profile_file.h"

CInstallHistory::CInstallHistory() { ReadCount(); }

int CInstallHistory::Run(int argc, char** argv) {
  if (!InitHistoryStore()) {
    std::cout << "Initialiation Failed:" << std::endl;
    return 1;
  }
  CInstallEvent event = RegisterEvent(argc, argv);
  if (!event.Valid) {
    return 2;
  }
  event.Dispatch();
  return 0;
}

bool CInstallHistory::InitHistoryStore() {
  if (!EnsureFolder(JoinPath(GetCommonAppDataPath(), "ZEK"))) {
    return false;
  }
  const std::string historyFolder = GetHistoryDir();
  if (!EnsureFolder(historyFolder)) {
    std::cout << " Failed to create path:" << historyFolder;
    return false;
  }
  // Unguarded, a run beside this one could count its event before the reset below undoes it.
  const ProfileGuard guard(GetHistoryFilePath());
  // A file that is there but could not be looked at must keep its count.
  const CIniFile history(GetHistoryFilePath());
  if (!FileExists(history.Path) && history.ReadString("History", "Count", "", 2).empty()) {
    ResetCount();
  }
  return true;
}

CInstallEvent CInstallHistory::RegisterEvent(int argc, char** argv) {
  const ProfileGuard guard(GetHistoryFilePath());
  ReadCount();  // once more: other runs may have counted since the construction
  CInstallEvent event(argc, argv);
  if (event.Valid && event.Mode == "-start") {
    // Unsigned, as a file edited by hand may hold the highest number there is.
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
