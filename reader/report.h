#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "reader/snapshot.h"

// An event's report, ORXInstallEvent.Log, read back. It has a start block and a snapshot, the
// messages, a snapshot, a result block and an end block. A message can contain any text, whole
// blocks too, and a run may break off at any byte. So a block counts only where the order of the
// blocks, the identity and the times of the event allow it; all other lines are messages.
//
// All views are raw bytes of the text that was parsed.

struct StartBlock {
  std::string_view Time;  // as in the report, "20261114 22:00:03"
  std::string_view Identity;
  std::string_view Product;
  std::string_view ServiceLevel;
  std::string_view CommandLine;
};

struct ResultBlock {
  std::string_view StartTime;
  std::string_view EndTime;
  std::string_view Product;
  std::string_view ServiceLevel;
  std::string_view Type;
  std::string_view Action;
  std::string_view Result;
  std::string_view LogFile;
  std::string_view TraceFile;
};

// One run of an event, from a start to the end or to the next start.
struct ReportRun {
  std::optional<StartBlock> Start;
  std::optional<std::string_view> Computer;  // its name
  std::string_view StartAction;              // as the box of the first snapshot has it
  std::optional<Snapshot> Before;
  std::optional<Snapshot> After;
  std::optional<ResultBlock> Result;
  std::vector<std::string_view> Messages;  // pieces of the text, each of whole lines
  bool IsWhole = true;                     // false if a block breaks off or is beyond a limit
};

// What is known of the event from elsewhere. Raw bytes.
struct ReportFacts {
  std::optional<std::string> Identity;
  std::optional<std::string> StartTime;
  std::optional<std::string> EndTime;
  bool IsPlaced = false;     // the report is in the folder of its copy, where no later run writes
  bool MayHaveEnded = true;  // false for an event that is open: nothing in its report is an end
};

// The runs in the order of the report, at least one; the last one is that of the facts. A report
// without a start block has one run, without Start. Of one with more than kMostStarts starts
// (reader/limits.h) only the first counts, and after kMostMarks lines that look like blocks all is
// message; the last run is not whole then.
std::vector<ReportRun> ParseReport(std::string_view text, const ReportFacts& facts);

// Replaces every CR LF, as reports of Windows have them, by LF.
void UnifyLineEnds(std::string& text);
