#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "history/ini_file.h"
#include "platform/profile_file.h"

// The record of one event. The fields are the values from this run's command line; the accessors
// read and write the event's section of the history file. Neither changes the other.
//
// Nothing here reports a failure: a step that fails has no effect, and the next steps still run.
class CInstallEvent {
 public:
  // The record for this run; argv[0] is skipped. A "-start" writes the first contents of the
  // event's section and creates the event's folder. If the command line names no event, Valid is
  // false, nothing is written and the paths are empty.
  CInstallEvent(int argc, char** argv);

  // A record for an event of the history. Only the accessors and CollectFiles may be used.
  explicit CInstallEvent(const std::string& identity);

  // Runs the steps of the event's kind, in their order. (app/event_dispatch.cpp)
  void Dispatch();

  // Copies the installer's log, trace and response file into the event's folder and sets their keys
  // to the copies. A file that is missing, or whose copy exists, is skipped: a second call changes
  // nothing. (report/collected_files.cpp)
  void CollectFiles();

  // The values of the event's section, read from the file by each call: at most 255 bytes, empty if
  // there is no such key or the file cannot be read. (history/event_keys.cpp)
  std::string GetLogFileName() const;
  std::string GetTraceFile() const;
  std::string GetResponseFile() const;
  std::string GetCopyName() const;
  std::string GetAction() const;
  std::string GetCommandLine() const;
  std::string GetPath() const;
  std::string GetEventLogFile() const;
  std::string GetEventID() const;
  std::string GetResult() const;
  std::string GetType() const;
  std::string GetCompleteFlag() const;
  std::string GetWiLogFile() const;
  std::string GetEndTime() const;
  std::string GetStartTime() const;
  std::string GetVersion() const;
  std::string GetServiceLevel() const;
  std::string GetProduct() const;

  // Write a value of any length, as CIniFile::WriteString does. The fields below do not change.
  void SetLogFileName(const std::string& value);
  void SetTraceFile(const std::string& value);
  void SetResponseFile(const std::string& value);
  void SetCopyName(const std::string& value);
  void SetAction(const std::string& value);
  void SetCommandLine(const std::string& value);
  void SetPath(const std::string& value);
  void SetEventLogFile(const std::string& value);
  void SetEventID(const std::string& value);
  void SetResult(const std::string& value);
  void SetType(const std::string& value);
  void SetCompleteFlag(const std::string& value);
  void SetWiLogFile(const std::string& value);
  void SetEndTime(const std::string& value);
  void SetStartTime(const std::string& value);
  void SetVersion(const std::string& value);
  void SetServiceLevel(const std::string& value);
  void SetProduct(const std::string& value);

  std::string EventID;       // names the event's section and folder
  bool Valid = false;        // the command line named an event
  std::string Mode;          // "-start", "-end", "-logmessage", or empty
  std::string EventLogPath;  // ORXInstallEvent.Log in the event's folder
  std::string LogFile;
  std::string TraceFile;
  std::string ResponseFile;
  std::string CommandLine;
  std::string EventFolder;
  std::string CopyName;
  std::string Message;
  std::string Action;
  std::string Type;
  std::string Path;
  std::string Result;
  std::string Product;
  std::string Version;
  std::string ServiceLevel;
  int32_t SectionNumber = 0;  // of the snapshot's next section
  CIniFile Ini;

  // Guards the history file from Run to the end of RecordStart, so that a "-start" replaces it
  // once; else null. Shared, as records are copied.
  std::shared_ptr<const ProfileGuard> StartGuard;

 private:
  void ParseOptions(int argc, char** argv);
  void CheckMode();
  void WriteDefaults();

  // True if the event's folder exists afterwards; prints a text to standard output if not.
  bool CreateEventFolder() const;

  void OpenEventLog() const;
  void RecordStart();
  void RecordEnd();

  // The blocks around the snapshots of a report. (eventlog/event_blocks.cpp)
  void WriteStartBlock() const;
  void WriteMessageBlock() const;
  void WriteResultBlock() const;
  void WriteEndBlock() const;

  // Moves the folder of an ended event below the folder of its copy, if it names one.
  // (eventlog/event_placement.cpp)
  void PlaceEventLog();

  // The state of the machine: an opening box, six numbered sections, a closing box.
  // (inventory/snapshot.cpp)
  void WriteSnapshot();
  void WriteUserSection();
  void WriteSoftwareSection();
  void WriteProcessSection();
  void WriteServiceSection();
  void WriteProductSection();
  void WriteODBCSection();
  void WriteSectionHeading(const char* title);

  std::string ReadKey(const char* key) const;
  void WriteKey(const char* key, const std::string& value);
};
