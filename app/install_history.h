#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

class CInstallEvent;
struct CCopyEvents;

// The top of the program: sets up the history, runs one event, or reports on all events.
class CInstallHistory {
 public:
  // Reads Count; 0 if there is no history file yet.
  CInstallHistory();

  // Runs the event that the command line names; argv[0] is skipped. Returns 0 if the event was
  // dispatched, even if its steps failed; 1 if the history folders cannot be created; 2 if the
  // command line names no event, and then only an empty history is created.
  int Run(int argc, char** argv);

  // Writes the summaries, collects the installer's files, and packs the history folder into the
  // archive of that name, absolute or relative to the working directory. Returns 1 when it prints
  // that the archive was created, else 0; IsArchiveComplete can still be false after a 1.
  // (report/archive.cpp)
  int Report(const std::string& archiveName);

  // Returns 0, and writes nothing, if there is no history file, else 1. (report/summary.cpp)
  int WriteSummary();

  // The names of all event sections in file order, up to 10240 bytes of names with their ends.
  // (report/copy_events.cpp)
  std::vector<std::string> GetEventSections() const;

  // Groups the events by their copies; the groups are in the order of their first events.
  // (report/copy_events.cpp)
  void GroupEvents(const std::vector<std::string>& sections,
                   std::vector<std::unique_ptr<CCopyEvents>>& groups) const;

  // After Report: false if the archive could not be completed or renamed to its name, or if a limit
  // of the zip format left something out of it.
  bool IsArchiveComplete = false;

  int32_t EventCount = 0;  // the number of starts so far

 private:
  // Creates the history folders and the history file if they do not exist. False if a folder
  // cannot be created.
  bool InitHistoryStore();

  // Builds the record of this run and counts a "-start"; to be called under a guard.
  CInstallEvent RegisterEvent(int argc, char** argv);

  void ReadCount();
  void WriteCount(int32_t count);
  void ResetCount();

  bool HistoryFileExists() const;
  int CreateArchive(const std::string& archiveName);
};
