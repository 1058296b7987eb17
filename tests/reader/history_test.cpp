// The model of a history: states, times, all that can go wrong in the calls, and its JSON.

#include <gtest/gtest.h>

#include <filesystem>
#include <numeric>

#include "app/install_history.h"
#include "inventory/service_list.h"
#include "reader/json.h"
#include "tests/reader/history_text.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

namespace {

TEST(Events, HaveTheStateOfTheirResult) {
  const std::pair<EventState, std::vector<const char*>> cases[] = {
      {EventState::kOk, {"Successful", "SUCCESS", "ok", "0", "1641", "3010"}},
      {EventState::kFailed,
       {"1603", "-1", "Failed (1603), rolled back", "Installation aborted", "user CANCELLED it",
        "fatal Error", "was Rolled Back"}},
      {EventState::kEnded, {"", "-", "Successful with a remark", "9.4"}},
  };
  for (const auto& [state, results] : cases) {
    for (const char* result : results) {
      EXPECT_EQ(StateOfResult(result), state) << result;
    }
  }
}

TEST(Events, HaveTheTimesThatExist) {
  const char* const cases[][2] = {{"20261114 22:00:03", "2026-11-14T22:00:03"},
                                  {"20240229 00:00:00", "2024-02-29T00:00:00"},
                                  {"00010101 23:59:59", "0001-01-01T23:59:59"}};
  for (const auto& [text, iso] : cases) {
    EXPECT_EQ(IsoTime(ParseLocalTime(text).value()), iso);
  }
  for (const char* text :
       {"20230229 00:00:00", "20261301 00:00:00", "20261114 24:00:00", "20261114 22:60:00",
        "20261114 22:00:60", "20261114 22:00:0", "20261114  2:00:03", "2026-11-14T22:00:03", ""}) {
    EXPECT_FALSE(ParseLocalTime(text)) << text;
  }
}

std::string Table(const std::vector<CServiceInfo>& services) {
  return LoggedText([&services] {
    CServicesList list;
    list.Services = services;
    list.Print();
  });
}

// Items of one identity: the equal ones belong together, then the first of each with the other. A
// text that is no table is not compared.
TEST(Changes, PairItemsOfOneIdentity) {
  const CServiceInfo started = {"", "ORX", "Started"};
  const CServiceInfo stopped = {"", "ORX", "Stopped"};
  const CServiceInfo paused = {"", "ORX", "Paused"};
  const std::string table = Table({started});
  const std::string stops = "changed services ORX|state Started > Stopped\n";
  const std::tuple<std::string, std::string, std::string> cases[] = {
      {Table({started, stopped}), Table({stopped, started}), ""},
      {Table({started, started}), Table({stopped, started}), stops},
      {Table({started, paused}), Table({paused, stopped, stopped}),
       stops + "added services ORX|state - > Stopped\n"},
      {Table({stopped, paused}), Table({started, {"", "ORX", "Is starting"}}),
       "changed services ORX|state Stopped > Started\n"
       "changed services ORX|state Paused > Is starting\n"},
      {Table({started, started}), table, "removed services ORX|state Started > -\n"},
      {Table({}), Table({{"", "b ORX", "Paused"}, {"", "a ORX", "Paused"}}),
       "added services b ORX|state - > Paused\nadded services a ORX|state - > Paused\n"},
      {table, table.substr(0, table.size() - 1), "not compared"},
      {table, table + "\n", "not compared"},
      {table, "\n" + table, "not compared"},
      {table, "", "not compared"},
  };
  for (const auto& [before, after, expected] : cases) {
    Snapshot old;
    Snapshot now;
    old.Parts[3] = before;
    now.Parts[3] = after;
    const Changes changes = CompareSnapshots(old, now, TextDecoder(), ChangeDetail::kList);
    const bool isCompared = changes.Compared[static_cast<size_t>(Section::kServices)];
    EXPECT_EQ(ChangeLines(changes) + (isCompared ? "" : "not compared"), expected) << after;
  }
}

// "identity, origin, state, action, product, report" for each event, and the findings, sorted.
std::string Summary(const HistoryOf& history) {
  std::string text = history.Findings();
  for (const Event& event : history.Result.Events) {
    const char* const origins[] = {", section, ", ", earlier run, ", ", orphan, "};
    text += event.Identity + origins[static_cast<int>(event.Origin)] +
            std::string(StateName(event.State)) + ", " + event.Action + ", " + event.Product +
            ", " + event.Report.value_or("-") + '\n';
  }
  const std::multiset<std::string> lines = SortedLines(text);
  return std::accumulate(lines.begin(), lines.end(), std::string());
}

// Starts an event, with further arguments, and ends it.
void Record(const std::string& identity, const char* option, const std::string& value) {
  RunTool({"-start", identity, option, value});
  RunTool({"-end", identity, "-CopyName", "C1", "-Result", "0"});
}

TEST(History, HasWhatWentWrongInTheCalls) {
  const ScratchHistory scratch;
  Record("fine", "-l", scratch.Make("setup.log"));
  RunTool({"-start", "open"});
  RunTool({"-end", "unstarted", "-CopyName", "C1"});
  Record("twice", "-Action", "Install");
  Record("twice", "-Action", "Remove");
  Record("lost", "-Action", "Install");
  std::filesystem::remove_all(InHistory("C1/lost"));
  scratch.Make("ZEK/ORXHistory/C2/alone/ORXInstallEvent.Log");
  RunTool({"-start", "again"});
  RunTool({"-start", "again", "-t", scratch.In("no.trc")});
  RunTool({"-end", "again"});
  // Two starts at once can leave the report of the earlier one before that of the later.
  RunTool({"-start", "both", "-Product", "first"});
  const std::string first = Replaced(WithoutTimes(FileText(InHistory("both/ORXInstallEvent.Log"))),
                                     "<time>", "20200101 00:00:00");
  Record("both", "-Product", "second");
  const std::string log = InHistory("C1/both/ORXInstallEvent.Log");
  WriteFileText(log, first + FileText(log));
  const HistoryOf unreported(scratch.In("ZEK/ORXHistory"));
  EXPECT_NE(unreported.Findings().find("note file-missing fine"), std::string::npos);

  const std::string archive = scratch.In("history.zip");
  CInstallHistory().Report(archive);
  EXPECT_EQ(scratch.Neutral(Summary(HistoryOf(archive))), Golden("checked_history.txt"));
  // One event by its name, with its earlier run.
  EXPECT_EQ(HistoryOf(archive, "twice").Result.Events.size(), 2U);
  EXPECT_EQ(HistoryOf(archive, "nobody").Result.Events.size(), 0U);
}

// The facts as the history file has them: names without case, the first of two, no quotation marks;
// bytes beyond UTF-8; a report, of Windows by its path, in which the tool left none.
TEST(History, IsReadFromFilesEditedByHand) {
  const ScratchHistory scratch;
  scratch.Make("ZEK/ORXHistory/History.ini",
               "[History]\r\nCount=2\r\n"
               "[B\xFChne \"1\"]\r\nEVENT_ID=x\r\nstart_time = 20261114 22:00:03\r\n"
               "Start_Time=20250101 00:00:00\r\nEnd_Time=never\r\nComplete_Flag=TRUE\r\n"
               "Product=\"ORX\tServer\"\r\nResult=\x01\x7F\xE2\x82\xAC\r\nCopy_Name=C1\r\n"
               "[b\xFChne \"1\"]\r\nEvent_ID=second\r\n"
               "[late]\r\nEvent_ID=late\r\nStart_Time=\r\n"
               "[early]\r\nStart_Time=20261114 22:00:02\r\n"
               "Event_Log_File=D:\\Data\\zek\\ORXHISTORY\\c1\\EARLY\\x.Log\r\n");
  scratch.Make("ZEK/ORXHistory/C1/early/X.log");
  const HistoryOf history(scratch.In("ZEK/ORXHistory"));
  std::string lines;
  for (const Event& event : history.Result.Events) {
    lines += EventJson("s", event) + " report " + event.Report.value_or("-") + '\n';
  }
  EXPECT_EQ(lines, Golden("edited_events.txt"));
}

}  // namespace
