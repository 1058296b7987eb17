#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "reader/change.h"
#include "reader/event_time.h"
#include "reader/finding.h"
#include "reader/source.h"
#include "reader/text_encoding.h"

enum class EventState { kOpen, kNoStart, kOk, kFailed, kEnded };

// "open", "no start", "ok", "failed" or "ended".
std::string_view StateName(EventState state);

// The state of an ended event: ok, failed, or ended if the result says neither.
EventState StateOfResult(std::string_view result);

enum class EventOrigin {
  kSection,     // a section of the history file
  kEarlierRun,  // a further start in the report of a section
  kOrphan,      // a report that no section names
};

// A file of the installer that the event names.
struct EventFile {
  std::string_view Key;    // "Log_File_Name", "Trace_File" or "Response_File"
  std::string Path;        // as the history file has it
  std::string Name;        // the last part of the path
  bool IsPresent = false;  // it is in the folder of the event
  uint64_t Size = 0;       // in bytes
};

// All texts are UTF-8; one that is not known is empty.
struct Event {
  std::string Identity;
  EventOrigin Origin = EventOrigin::kSection;
  EventState State = EventState::kOpen;
  std::optional<std::string> Computer;  // from the report
  std::optional<LocalTime> Started;
  std::optional<LocalTime> Ended;
  std::string Action;
  std::string Type;
  std::string Product;
  std::string Version;
  std::string ServiceLevel;
  std::string Path;
  std::string Copy;  // "(Unknown)" until the end
  std::string Result;
  std::string CommandLine;
  std::optional<std::string> Report;  // its path below the folder of the history
  bool IsReportWhole = true;          // false if a block of it breaks off
  std::vector<EventFile> Files;
  std::string Messages;    // a line each, with a line feed at its end
  bool HasBefore = false;  // a snapshot before, and one after; perhaps not whole
  bool HasAfter = false;
  Changes Differences;
};

// Calls the function with each message in its order.
void ForEachMessage(const Event& event, const std::function<void(std::string_view)>& use);

struct History {
  std::string Source;         // its name, as on the command line
  std::vector<Event> Events;  // oldest start first; then those without a start
  bool HasHistoryFile = false;
  bool WasReported = false;     // a report has been made: installer files have been collected
  size_t SectionNameBytes = 0;  // of the list of section names, with its ends
  size_t Starts = 0;            // starts that the history file has counted
};

enum class Detail {
  kCounts,  // the facts and the number of changes
  kAll,     // with messages and changes
};

// Reads the events of a history; with an identity (UTF-8) those of this one only, which reads no
// report of another event. What cannot be read or is beyond a limit (reader/limits.h) is left out
// and in the source's findings. Reports are read one after another; no event keeps the text of one.
History ReadHistory(Source& source, const TextDecoder& decoder, Detail detail,
                    const std::optional<std::string>& identity = std::nullopt);
