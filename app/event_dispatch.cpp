#include <utility>

#include "app/install_event.h"
#include "eventlog/logger.h"
#include "history/locations.h"
#include "history/timestamp.h"
#include "inventory/computer_info.h"
#include "platform/files.h"
#include "platform/path.h"
#include "platform/profile_file.h"

static void WriteComputerInfo() {
  CComputerInfo computer;
  computer.Collect();
  computer.Print();
}

void CInstallEvent::Dispatch() {
  SectionNumber = 1;
  OpenEventLog();
  if (Mode == "-start") {
    RecordStart();
    WriteStartBlock();
    WriteComputerInfo();
    WriteSnapshot();
    CLogger::GetInstance().Close();
  } else if (Mode == "-logmessage") {
    WriteMessageBlock();
    CLogger::GetInstance().Close();
  } else if (Mode == "-end") {
    // The result block reads the keys back; the log must be closed before its folder is moved.
    RecordEnd();
    WriteSnapshot();
    WriteResultBlock();
    WriteEndBlock();
    CLogger::GetInstance().Close();
    PlaceEventLog();
  }
}

void CInstallEvent::OpenEventLog() const {
  if (LeadsElsewhere(JoinPath(EventID, "ORXInstallEvent.Log"))) {
    return;  // like a log that cannot be opened: the text is dropped
  }
  if (KindOf(EventLogPath) == FileKind::kOther) {
    return;  // opening a pipe would wait for its reader
  }
  CLogger& log = CLogger::GetInstance();
  if (Mode == "-start") {
    log.Open(EventLogPath, std::ios::out);
  }
  // A start appends too, after emptying the log, so that it does not overwrite a message that
  // another run appends meanwhile.
  log.Open(EventLogPath, std::ios::app);
}

void CInstallEvent::RecordStart() {
  const ProfileGuard guard(Ini.Path);
  const auto guardOfRun = std::move(StartGuard);  // released here too, before the snapshot
  SetStartTime(GetTimestamp());
  SetEndTime("");
  SetProduct(Product);
  SetVersion(Version);
  SetServiceLevel(ServiceLevel);
  SetType(Type);
  SetPath(Path);
  SetAction(Action);
  SetCopyName("(Unknown)");  // only "-end" names the copy
  SetCompleteFlag("FALSE");
  SetLogFileName(LogFile);
  SetTraceFile(TraceFile);
  SetResponseFile(ResponseFile);
  SetCommandLine(CommandLine);
}

void CInstallEvent::RecordEnd() {
  const ProfileGuard guard(Ini.Path);
  SetEndTime(GetTimestamp());
  SetCopyName(CopyName);
  SetCompleteFlag("TRUE");
  if (!Action.empty()) {
    SetAction(Action);
  }
  SetResult(Result);
  if (!LogFile.empty()) {
    SetLogFileName(LogFile);
  }
  if (!TraceFile.empty()) {
    SetTraceFile(TraceFile);
  }
  if (!ResponseFile.empty()) {
    SetResponseFile(ResponseFile);
  }
  if (!Path.empty()) {
    SetPath(Path);
  }
}
