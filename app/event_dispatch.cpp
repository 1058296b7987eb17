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
    // The keys come first, as the result block reads them back; the move comes last, as it takes
    // the folder of the log.
    RecordEnd();
    WriteSnapshot();
    WriteResultBlock();
    WriteEndBlock();
    CLogger::GetInstance().Close();
    PlaceEventLog();
  }
}

void CInstallEvent::OpenEventLog() const {
  if (LeadsOutOfHistory(JoinPath(EventID, "ORXInstallEvent.Log"))) {
    return;  // a logger that was never opened drops all text, as one that failed to open does
  }
  if (KindOf(EventLogPath) == FileKind::kOther) {
    return;  // a pipe would hold the run up until somebody reads from it
  }
  CLogger& log = CLogger::GetInstance();
  if (Mode == "-start") {
    log.Open(EventLogPath, std::ios::out);
  }
  // A start appends as well, to the log that it has emptied: a message that another run sends in
  // the meantime is not written over.
  log.Open(EventLogPath, std::ios::app);
}

void CInstallEvent::RecordStart() {
  const ProfileGuard guard(Ini.Path);
  const auto guardOfRun = std::move(StartGuard);  // ends here too: the snapshot takes its time
  SetStartTime(GetTimestamp());
  SetEndTime("");
  SetProduct(Product);
  SetVersion(Version);
  SetServiceLevel(ServiceLevel);
  SetType(Type);
  SetPath(Path);
  SetAction(Action);
  SetCopyName("(Unknown)");  // the copy counts from the end on
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
