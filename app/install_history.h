#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

class CInstallEvent;
struct CCopyEvents;

// The top of the tool: the set-up of the history, one event of a run, the report over all of it.
class CInstallHistory {
 public:
  // Reads Count; 0 where there is no history file yet.
  CInstallHistory();

  // One event, as the command line names it; element 0 is not looked at. Gives 0 when the event
  // was dispatched, whatever its steps met; 1 when the history folders cannot be made; 2 when the
  // command line names no event, and then nothing but the empty history was written.
  int Run(int argc, char** argv);

  // Writes the summaries, collects the installer's files, and packs the history folder into the
  // archive of that name, absolute or relative to the working directory. Returns 1 when it prints
  // that the archive was created, else 0; IsArchiveComplete can still be false after a 1.
  // (report/archive.cpp)
  int Report(const std::string& archiveName);

  // 0 when there is no history file and nothing was written, else 1. (report/summary.cpp)
  int WriteSummary();

  // The names of all event sections in file order; what takes more than 10240 bytes is missing.
  // (report/copy_events.cpp)
  std::vector<std::string> GetEventSections() const;

  // Puts the events into the groups of their copies; groups stand in the order of their first
  // events. (report/copy_events.cpp)
  void GroupEvents(const std::vector<std::string>& sections,
                   std::vector<std::unique_ptr<CCopyEvents>>& groups) const;

  // After Report: false if the archive was not put in place, or lacks what the zip format has no
  // room for.
  bool IsArchiveComplete = false;

  int32_t EventCount = 0;  // the starts so far; told to no one but the history file

 private:
  // True when the history folders and the history file are there.
  bool InitHistoryStore();

  // Builds the record of this run and counts a "-start"; to be called under a guard.
  CInstallEvent RegisterEvent(int argc, char** argv);

  void ReadCount();
  void WriteCount(int32_t count);
  void ResetCount();

  bool HistoryFileExists() const;
  int CreateArchive(const std::string& archiveName);
};
