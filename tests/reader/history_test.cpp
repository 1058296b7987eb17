// The model of a history: states, times, all that can go wrong in the calls, and its JSON.

#include <gtest/gtest.h>

#include <filesystem>
#include <regex>
#include <set>
#include <tuple>

#include "app/install_history.h"
#include "inventory/service_list.h"
#include "reader/check.h"
#include "reader/history.h"
#include "reader/json.h"
#include "tests/reader/change_text.h"
#include "tests/reader/history_of.h"
#include "tests/support/fake_machine.h"
#include "tests/support/file_text.h"
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

using Rows = std::vector<std::pair<std::string, std::string>>;

std::string Services(const Rows& services) {
  return LoggedText([&services] {
    CServicesList list;
    for (const auto& [name, state] : services) {
      list.Services.push_back({"", name, state});
    }
    list.Print();
  });
}

Changes CompareServices(const std::string& before, const std::string& after) {
  Snapshot old;
  Snapshot now;
  old.Parts[3] = before;
  now.Parts[3] = after;
  return CompareSnapshots(old, now, TextDecoder(), ChangeDetail::kList);
}

// Items of one identity: the equal ones belong together, then the first of each with the other.
TEST(Changes, PairItemsOfOneIdentity) {
  const std::pair<std::string, std::string> started = {"ORX", "Started"};
  const std::pair<std::string, std::string> stopped = {"ORX", "Stopped"};
  const std::pair<std::string, std::string> paused = {"ORX", "Paused"};
  const std::string stops = "changed services ORX|state Started > Stopped";
  const std::tuple<Rows, Rows, std::vector<std::string>> cases[] = {
      {{started, stopped}, {stopped, started}, {}},
      {{started, started}, {stopped, started}, {stops}},
      {{started, paused},
       {paused, stopped, stopped},
       {stops, "added services ORX|state - > Stopped"}},
      {{started, started}, {started}, {"removed services ORX|state Started > -"}},
      {{},
       {{"ORX b", "Paused"}, {"ORX a", "Paused"}},
       {"added services ORX b|state - > Paused", "added services ORX a|state - > Paused"}},
  };
  for (const auto& [before, after, changes] : cases) {
    EXPECT_EQ(ChangeTexts(CompareServices(Services(before), Services(after))), changes);
  }
}

TEST(Changes, AreNotReadFromATableThatIsNone) {
  const std::string before = Services({{"ORX", "Started"}});
  for (const std::string& after :
       {before.substr(0, before.size() - 1), before + "\n", "\n" + before, std::string()}) {
    const Changes changes = CompareServices(before, after);
    EXPECT_TRUE(changes.List.empty());
    EXPECT_FALSE(changes.Compared[static_cast<size_t>(Section::kServices)]);
  }
}

std::string FolderOf(const ScratchHistory& scratch) { return scratch.In("ZEK/ORXHistory"); }

// A level, a code and an event, or "-" for none, for each finding.
std::set<std::string> Codes(const History& history) {
  std::set<std::string> codes;
  for (const Finding& finding : CheckHistory(history)) {
    EXPECT_FALSE(finding.Text.empty());
    codes.insert(std::string(LevelName(finding.Level)) + ' ' + finding.Code + ' ' +
                 (finding.Event.empty() ? "-" : finding.Event));
  }
  return codes;
}

// An identity, an origin, a state and a report for each event.
std::set<std::string> Lines(const History& history) {
  std::set<std::string> lines;
  for (const Event& event : history.Events) {
    const char* const origins[] = {"section", "earlier run", "orphan"};
    lines.insert(event.Identity + ", " + origins[static_cast<int>(event.Origin)] + ", " +
                 std::string(StateName(event.State)) + ", " + event.Report.value_or("-"));
  }
  return lines;
}

TEST(Check, FindsWhatWentWrongInTheCalls) {
  const ScratchHistory scratch;
  scratch.Make("setup.log");
  RunTool({"-start", "fine", "-l", scratch.In("setup.log")});
  RunTool({"-end", "fine", "-CopyName", "C1", "-Result", "0"});
  RunTool({"-start", "open"});
  RunTool({"-end", "unstarted", "-CopyName", "C1"});
  for (int i = 0; i < 2; ++i) {
    RunTool({"-start", "twice", "-Action", i == 0 ? "Install" : "Remove"});
    RunTool({"-end", "twice", "-CopyName", "C1", "-Result", "0"});
  }
  RunTool({"-start", "lost"});
  RunTool({"-end", "lost", "-CopyName", "C1"});
  std::filesystem::remove_all(scratch.In("ZEK/ORXHistory/C1/lost"));
  scratch.Make("ZEK/ORXHistory/C2/alone/ORXInstallEvent.Log");
  RunTool({"-start", "again"});
  RunTool({"-start", "again", "-t", scratch.In("no.trc")});
  RunTool({"-end", "again"});
  EXPECT_TRUE(Codes(HistoryOf(FolderOf(scratch)).Result).contains("note file-missing fine"));

  const std::string archive = scratch.In("history.zip");
  CInstallHistory().Report(archive);
  const HistoryOf history(archive);
  std::set<std::string> lines = Lines(history.Result);
  lines.merge(Codes(history.Result));
  std::string text;
  for (const std::string& line : lines) {
    text += line + '\n';
  }
  EXPECT_EQ(text, Golden("checked_history.txt"));
  // One event by its name, with its earlier run.
  EXPECT_EQ(Lines(HistoryOf(archive, "twice").Result).size(), 2U);
  EXPECT_EQ(HistoryOf(archive, "nobody").Result.Events.size(), 0U);
}

TEST(Check, WarnsBeforeTheListOfNamesIsFull) {
  const std::pair<size_t, std::string> cases[] = {{8192, ""},
                                                  {8193, "warning names-limit -"},
                                                  {10240, "warning names-limit -"},
                                                  {10241, "error names-limit -"}};
  for (const auto& [bytes, code] : cases) {
    const ScratchHistory scratch;
    // The names with their ends, and one more end.
    const std::string name(bytes - std::string("History").size() - 3, 'n');
    scratch.Make("ZEK/ORXHistory/History.ini", "[History]\nCount=0\n[" + name + "]\nEnd_Time=x\n");
    std::set<std::string> codes = Codes(HistoryOf(FolderOf(scratch)).Result);
    std::erase_if(codes, [](const auto& each) { return !each.ends_with(" names-limit -"); });
    EXPECT_EQ(codes, code.empty() ? std::set<std::string>() : std::set{code}) << bytes;
  }
}

// Two starts at once can leave the report of the earlier one before that of the later.
TEST(History, HasTheEarlierRunOfAReport) {
  const ScratchHistory scratch;
  RunTool({"-start", "1", "-Product", "first"});
  const std::string first = std::regex_replace(FileText(InHistory("1/ORXInstallEvent.Log")),
                                               std::regex("[0-9]{8} "), "20200101 ");
  RunTool({"-start", "1", "-Product", "second"});
  RunTool({"-end", "1", "-Result", "0"});
  const std::string log = InHistory("1/ORXInstallEvent.Log");
  WriteFileText(log, first + FileText(log));
  const HistoryOf history(FolderOf(scratch));
  std::string lines;
  for (const Event& event : history.Result.Events) {
    lines += event.Product + ' ' + std::string(StateName(event.State)) + '\n';
  }
  EXPECT_EQ(lines, "first open\nsecond ok\n");
  EXPECT_TRUE(Codes(history.Result).contains("warning started-again 1"));
}

// The facts as the history file has them: names without case, the first of two, no quotation marks;
// bytes beyond UTF-8; a report in which the tool left none.
TEST(History, IsReadFromFilesEditedByHand) {
  const ScratchHistory scratch;
  scratch.Make("ZEK/ORXHistory/History.ini",
               "[History]\r\nCount=2\r\n"
               "[B\xFChne \"1\"]\r\nEVENT_ID=x\r\nstart_time = 20261114 22:00:03\r\n"
               "Start_Time=20250101 00:00:00\r\nEnd_Time=never\r\nComplete_Flag=TRUE\r\n"
               "Product=\"ORX\tServer\"\r\nResult=\x01\x7F\xE2\x82\xAC\r\nCopy_Name=C1\r\n"
               "[b\xFChne \"1\"]\r\nEvent_ID=second\r\n"
               "[late]\r\nEvent_ID=late\r\nStart_Time=\r\n"
               "[early]\r\nStart_Time=20261114 22:00:02\r\n");
  const HistoryOf history(FolderOf(scratch));
  std::string lines;
  for (const Event& event : history.Result.Events) {
    lines += EventJson("s", event) + '\n';
  }
  EXPECT_EQ(lines, Golden("edited_events.txt"));
}

}  // namespace
