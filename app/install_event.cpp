#include "app/install_event.h"

#include <iostream>

#include "app/options.h"
#include "history/locations.h"
#include "platform/path.h"

CInstallEvent::CInstallEvent(int argc, char** argv) : Ini(GetHistoryFilePath()) {
  ParseOptions(argc, argv);
  CheckMode();
  if (!Valid) {
    return;
  }
  EventFolder = JoinPath(GetHistoryDir(), EventID);
  EventLogPath = JoinPath(EventFolder, "ORXInstallEvent.Log");
  if (Mode == "-start") {
    WriteDefaults();
    CreateEventFolder();
  }
}

CInstallEvent::CInstallEvent(const std::string& identity)
    : EventID(identity), Ini(GetHistoryFilePath()) {}

void CInstallEvent::ParseOptions(int argc, char** argv) {
  // An option as the last argument has no value and is dropped.
  for (int i = 1; i + 1 < argc; ++i) {
    const Option* option = FindOption(argv[i]);
    if (option == nullptr) {
      continue;
    }
    ++i;
    this->*option->Field = argv[i];
    if (option->Field == &CInstallEvent::EventID) {
      Mode = option->Word;
    }
  }
}

void CInstallEvent::CheckMode() { Valid = !Mode.empty() && !EventID.empty(); }

void CInstallEvent::WriteDefaults() {
  SetEventID(EventID);
  SetCommandLine("");
  SetStartTime("");
  SetEndTime("");
  SetAction("");
  SetType("");
  SetProduct("");
  SetVersion("");
  SetServiceLevel("");
  SetPath("");
  SetCopyName("(Unknown)");
  SetCompleteFlag("FALSE");
  SetLogFileName("(none)");
  SetTraceFile("(none)");
  SetResponseFile("(none)");
  SetEventLogFile(EventLogPath);
  SetResult("");
}

bool CInstallEvent::CreateEventFolder() const {
  if (CanHoldEvent(EventID) && EnsureFolder(EventFolder)) {
    return true;
  }
  std::cout << " Failed to create path:" << EventFolder;
  return false;
}
