// Histories at a limit and beyond it: what is beyond is left out, and a finding says so.

#include <gtest/gtest.h>

#include <functional>

#include "reader/check.h"
#include "reader/limits.h"
#include "tests/reader/history_of.h"
#include "tests/support/file_text.h"
#include "tests/support/scratch_history.h"

namespace {

const std::string time = "20261114 22:00:03";
const std::string ini =
    "[42]\nStart_Time=" + time + "\nEnd_Time=" + time + "\nCopy_Name=C1\nResult=0\n";

std::string Repeated(size_t count, const std::string& text) {
  std::string all;
  for (size_t i = 0; i < count; ++i) {
    all += text;
  }
  return all;
}

// The golden report with something inserted before each occurrence of a text.
std::string ReportWith(const std::string& inserted, const std::string& before) {
  return Replaced(Replaced(Golden("ORXInstallEvent.Log"), "<time>", time), before,
                  inserted + before);
}

std::string Sections(size_t count) {
  std::string sections;
  for (size_t i = 0; i < count; ++i) {
    sections += '[' + std::to_string(i) + "]\nResult=0\n";
  }
  return sections;
}

struct LimitCase {
  const char* Finding;
  size_t Within;
  size_t Beyond;  // as much more
  size_t EventsBeyond;
  std::function<std::string(size_t)> HistoryFile;
  std::function<std::string(size_t)> Report;
};

std::string SameFile(size_t) { return ini; }
std::string SameReport(size_t) { return ReportWith("", time); }

const LimitCase limitCases[] = {
    {"more than 8 MiB", kMostBytesOfHistoryFile, 1, 1,
     [](size_t size) { return ini + std::string(size - ini.size(), 'x'); }, SameReport},
    {"more than 500,000 lines", kMostLinesOfHistoryFile, 1, 1,
     [](size_t lines) { return ini + std::string(lines - 5, '\n'); }, SameReport},
    // The report is one more.
    {"more than 40,000 events", kMostEvents - 1, 1, kMostEvents, Sections, SameReport},
    // Each of these bytes has three in UTF-8.
    {"take more than 16 MiB", kMostBytesOfFacts / 3 - 1000, 1000, 0,
     [](size_t size) { return ini + "Product=" + std::string(size, '\x80') + "\n"; }, SameReport},
    {"take more than 4 MiB", kMostBytesOfEvent - 40000, 40000, 1, SameFile,
     [](size_t size) { return ReportWith(std::string(size, 'm'), "Copying files\n"); }},
    {"breaks off", kMostStarts - 1, 1, 1, SameFile,
     [](size_t runs) {
       const std::string whole = SameReport(0);
       const std::string open = whole.substr(0, whole.find("Copying files\n"));
       return Repeated(runs, Replaced(open, time, "20200101 22:00:03")) + whole;
     }},
    {"cannot be compared", kMostRows - 10, 10, 1, SameFile,
     [](size_t rows) {
       return ReportWith(Repeated(rows, "1                  p\n"), "4                  UNK_NAME\n");
     }},
};

std::string FindingsOf(const LimitCase& limit, size_t size, size_t& events) {
  const ScratchHistory scratch;
  scratch.Make("ZEK/ORXHistory/History.ini", limit.HistoryFile(size));
  scratch.Make("ZEK/ORXHistory/C1/42/ORXInstallEvent.Log", limit.Report(size));
  const HistoryOf history(scratch.In("ZEK/ORXHistory"));
  events = history.Result.Events.size();
  std::string texts;
  for (const FindingList& list : {history.From->Findings, CheckHistory(history.Result)}) {
    for (const Finding& finding : list) {
      texts += finding.Code == "damaged" ? finding.Text + '\n' : "";
    }
  }
  return texts;
}

TEST(Limits, LeaveOutWhatIsBeyondThem) {
  for (const LimitCase& limit : limitCases) {
    size_t events = 0;
    const std::string within = FindingsOf(limit, limit.Within, events);
    EXPECT_EQ(within.find(limit.Finding), within.npos) << limit.Finding << ": " << within;
    const std::string beyond = FindingsOf(limit, limit.Within + limit.Beyond, events);
    EXPECT_NE(beyond.find(limit.Finding), beyond.npos) << limit.Finding << ": " << beyond;
    EXPECT_EQ(events, limit.EventsBeyond) << limit.Finding;
  }
}

}  // namespace
