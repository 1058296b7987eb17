#include <string>

#include "app/install_event.h"
#include "history/locations.h"
#include "platform/files.h"
#include "platform/path.h"

void CInstallEvent::PlaceEventLog() {
  if (CopyName.empty() || LeadsElsewhere(EventID) || !CanHoldEvent(JoinPath(CopyName, EventID))) {
    return;
  }
  const std::string copyFolder = JoinPath(GetHistoryDir(), CopyName);
  const std::string target = JoinPath(copyFolder, EventID);
  if (!EnsureFolder(copyFolder) || !MoveFolder(EventFolder, target)) {
    return;
  }
  SetEventLogFile(JoinPath(target, "ORXInstallEvent.Log"));
}
