// Histories at a limit and beyond it: what is beyond is left out, and a finding says so.

#include <gtest/gtest.h>

#include <functional>

#include "reader/limits.h"
#include "tests/reader/history_text.h"
#include "tests/support/scratch_history.h"

namespace {

const std::string ini = "[42]\nStart_Time=" + std::string(startTime) + "\nEnd_Time=" + endTime +
                        "\nCopy_Name=C1\nResult=0\n";

// The golden report with something inserted before each occurrence of a text.
std::string ReportWith(const std::string& inserted, const std::string& before) {
  return Replaced(GoldenReport(), before, inserted + before);
}

std::string Sections(size_t count) {
  std::string sections;
  for (size_t i = 0; i < count; ++i) {
    sections += '[' + std::to_string(i) + "]\nResult=0\n";
  }
  return sections;
}

// The list of section names has the names with their ends, and one more end.
std::string LongName(size_t bytes) {
  return "[History]\nCount=0\n[" + std::string(bytes - sizeof "History" - 2, 'n') +
         "]\nEnd_Time=x\n";
}

struct LimitCase {
  const char* Finding;
  size_t Within;
  size_t Beyond;  // as much more
  size_t EventsBeyond;
  std::function<std::string(size_t)> HistoryFile;  // null: the one above
  std::function<std::string(size_t)> Report = {};  // null: the golden one
};

const LimitCase limitCases[] = {
    {"warning names-limit : the list of section names has 8193 of 10240 bytes: beyond", 8192, 1, 2,
     LongName},
    {"error names-limit : the list of section names has 10241 of 10240 bytes: the", 10240, 1, 2,
     LongName},
    {"more than 8 MiB", kMostBytesOfHistoryFile, 1, 1,
     [](size_t size) { return ini + std::string(size - ini.size(), 'x'); }},
    {"more than 500,000 lines", kMostLinesOfHistoryFile, 1, 1,
     [](size_t lines) { return ini + std::string(lines - 5, '\n'); }},
    // The report is one more.
    {"more than 40,000 events", kMostEvents - 1, 1, kMostEvents, Sections},
    // Each of these bytes has three in UTF-8.
    {"take more than 16 MiB", kMostBytesOfFacts / 3 - 1000, 1000, 0,
     [](size_t size) { return ini + "Product=" + std::string(size, '\x80') + "\n"; }},
    {"take more than 4 MiB", kMostBytesOfEvent - 40000, 40000, 1, nullptr,
     [](size_t size) { return ReportWith(std::string(size, 'm'), "Copying files\n"); }},
    {"breaks off", kMostStarts - 1, 1, 1, nullptr,
     [](size_t runs) {
       const std::string whole = GoldenReport();
       const std::string open = whole.substr(0, whole.find("Copying files\n"));
       return Repeated(Replaced(open, startTime, "20200101 22:00:03"), runs) + whole;
     }},
    {"damaged 42: the report C1/42/ORXInstallEvent.Log has a list", kMostRows - 10, 10, 1, nullptr,
     [](size_t rows) {
       return ReportWith(Repeated("1                  p\n", rows), "4                  UNK_NAME\n");
     }},
};

HistoryOf HistoryWith(const LimitCase& limit, size_t size) {
  const ScratchHistory scratch;
  scratch.Make("ZEK/ORXHistory/History.ini", limit.HistoryFile ? limit.HistoryFile(size) : ini);
  scratch.Make("ZEK/ORXHistory/C1/42/ORXInstallEvent.Log",
               limit.Report ? limit.Report(size) : GoldenReport());
  return HistoryOf(scratch.In("ZEK/ORXHistory"));
}

TEST(Limits, LeaveOutWhatIsBeyondThem) {
  for (const LimitCase& limit : limitCases) {
    const std::string within = HistoryWith(limit, limit.Within).Findings();
    EXPECT_EQ(within.find(limit.Finding), within.npos) << limit.Finding << ": " << within;
    const HistoryOf history = HistoryWith(limit, limit.Within + limit.Beyond);
    const std::string beyond = history.Findings();
    EXPECT_NE(beyond.find(limit.Finding), beyond.npos) << limit.Finding << ": " << beyond;
    EXPECT_EQ(history.Result.Events.size(), limit.EventsBeyond) << limit.Finding;
  }
}

}  // namespace
