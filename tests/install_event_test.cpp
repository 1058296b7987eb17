#include "app/install_event.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <iterator>
#include <regex>
#include <sstream>
#include <vector>

#include "app/usage.h"
#include "history/locations.h"
#include "tests/fake_machine.h"

namespace {

using Words = std::vector<std::string>;

// What a command line, split at its blanks, says: kind, identity, -l, -u, -Type, -message.
std::string Parsed(const std::string& commandLine) {
  std::istringstream words(commandLine);
  ProgramArguments arguments({std::istream_iterator<std::string>(words), {}});
  const CInstallEvent event(arguments.Count(), arguments.Vector());
  EXPECT_EQ(event.Valid, !event.Mode.empty()) << commandLine;
  return event.Mode + ',' + event.EventID + ',' + event.LogFile + ',' + event.ResponseFile + ',' +
         event.Type + ',' + event.Message;
}

TEST(InstallEvent, TakesOptionsFromTheCommandLine) {
  const ScratchHistory scratch;
  const std::pair<const char*, const char*> cases[] = {
      {"", ",,,,,"},
      {"-end", ",,,,,"},
      {"-l -end 7", ",,-end,,,"},
      {"-LOGMESSAGE 7 -MESSAGE -l", "-logmessage,7,,,,-l"},
      {"-InstallType GUI -end 7 -type", "-end,7,,,,"},
      {"-start 7 -end 8 -x -L a", "-end,8,a,,,"},
      {"x -end 7 -u one -U two", "-end,7,,two,,"},
  };
  for (const auto& [commandLine, parsed] : cases) {
    EXPECT_EQ(Parsed(commandLine), parsed);
  }
  EXPECT_EQ(scratch.Tree(), "");
}

TEST(InstallEvent, HasAUsageText) {
  testing::internal::CaptureStdout();
  PrintUsage();
  EXPECT_EQ(testing::internal::GetCapturedStdout(), Golden("usage.txt"));
}

// A -start or an -end that names everything, each its own things.
Words Full(const std::string& kind, const std::string& identity) {
  Words words = {kind, identity};
  for (const char* option : {"Command", "message", "CopyName", "Type", "Version", "ServiceLevel",
                             "Result", "Product", "Path", "Action", "l", "t", "u"}) {
    words.push_back(std::string("-") + option);
    words.push_back(std::string(option) + " of " + kind);
  }
  return words;
}

// The history file without the blank lines that some systems set between its sections.
std::string HistoryText(const ScratchHistory& scratch) {
  const std::string text = scratch.Neutral(FileText(GetHistoryFilePath()));
  return std::regex_replace(text, std::regex("\n+"), "\n");
}

TEST(InstallEvent, KeepsTheGoldenHistory) {
  const ScratchHistory scratch;
  scratch.Make("outside/");
  EXPECT_EQ(RunTool({}), 2);
  EXPECT_EQ(RunTool({"-start", ""}), 2);
  const Words endOfAgain = {"-end", "again", "-CopyName", "C1"};
  const Words runs[] = {
      {"-end", "only ended", "-CopyName", "C1"},
      {"-logmessage", "only a message", "-message", "m"},
      {"-START", "only started", "-CopyName", "not yet"},
      Full("-start", "kept"),
      {"-end", "kept", "-Product", "ignored", "-Result", "first"},
      {"-start", "never", "-end", "kept"},
      Full("-start", "changed"),
      Full("-end", "changed"),
      Full("-start", "again"),
      endOfAgain,
      {"-start", "History", "-Type", "GUI"},
      {"-start", "stays"},
  };
  for (const Words& words : runs) {
    EXPECT_EQ(RunTool(words), 0);
  }
  // Identities and copy names that lead out of the history folder, or into none.
  testing::internal::CaptureStdout();
  for (const std::string& name : Words{"..", "../../outside", "../outside", "x/../../outside",
                                       ". .", scratch.In("outside"), "nowhere/1"}) {
    EXPECT_EQ(RunTool({"-start", name}), 0);
    RunTool({"-end", "stays", "-CopyName", name});
  }
  const std::string output = scratch.Neutral(testing::internal::GetCapturedStdout());
  // What comes later finds no folder; then a folder of its own, but the target taken.
  const std::string first = FileText(InHistory("C1/again/ORXInstallEvent.Log"));
  RunTool({"-logmessage", "again", "-message", "late"});
  for (int start = 0; start < 2; ++start) {
    RunTool({"-start", "again"});
  }
  RunTool(endOfAgain);
  EXPECT_EQ(output + '\n' + HistoryText(scratch) + scratch.Tree(), Golden("event_history.txt"));
  EXPECT_EQ(FileText(InHistory("C1/again/ORXInstallEvent.Log")), first);
  const std::string second = FileText(InHistory("again/ORXInstallEvent.Log"));
  EXPECT_EQ(second.rfind("---------- ORX Installation History Logger ( Start )"), 0U);

  std::filesystem::remove(GetHistoryFilePath());
  EXPECT_EQ(RunTool({}), 2);
  EXPECT_EQ(HistoryText(scratch), "[History]\nCount=0\n");
}

TEST(InstallEvent, FailsWithoutTheHistoryFolder) {
  const ScratchHistory scratch;
<<<<<<< HEAD
  RunTool({"-end", "7", "-Result", "early"});
  CInstallEvent event("7");
  EXPECT_EQ(event.GetResult(), "early");
  EXPECT_EQ(event.GetEventID(), "");

  RunTool(
      {"-start", "7", "-Action", "Install", "-Product", "P", "-l", "start.log", "-CopyName", "C"});
  EXPECT_EQ(event.GetEventID(), "7");
  EXPECT_EQ(event.GetCopyName(), "(Unknown)");
  EXPECT_EQ(event.GetCompleteFlag(), "FALSE");
  EXPECT_EQ(event.GetEndTime(), "");
  EXPECT_EQ(event.GetResult(), "");
  EXPECT_EQ(event.GetTraceFile(), "");

  RunTool({"-end", "7", "-Product", "Q", "-t", "end.trc"});
  EXPECT_EQ(event.GetProduct(), "P");
  EXPECT_EQ(event.GetAction(), "Install");
  EXPECT_EQ(event.GetLogFileName(), "start.log");
  EXPECT_EQ(event.GetTraceFile(), "end.trc");
  EXPECT_EQ(event.GetCopyName(), "");
  EXPECT_EQ(event.GetCompleteFlag(), "TRUE");
  EXPECT_EQ(event.GetEndTime().size(), 17U);
  EXPECT_EQ(event.GetEventLogFile(),
            JoinPath(JoinPath(GetHistoryDir(), "7"), "ORXInstallEvent.Log"));

  RunTool({"-start", "History", "-Type", "GUI"});
  EXPECT_EQ(CInstallHistory().EventCount, 2);
  EXPECT_EQ(CInstallEvent("History").GetType(), "GUI");
}

TEST(InstallEvent, MovesEndedEventsBelowTheirCopy) {
  const ScratchHistory scratch;
  const std::string copy = JoinPath(GetHistoryDir(), "C1");
  RunTool({"-end", "0", "-CopyName", "C1"});  // no start: the copy's folder alone
  EXPECT_TRUE(DirExists(copy));
  EXPECT_EQ(CInstallEvent("0").GetEventLogFile(), "");
  for (const std::string id : {"1", "2"}) {
    RunTool({"-start", id});
    RunTool({"-end", id, "-CopyName", "C1"});
    EXPECT_FALSE(DirExists(JoinPath(GetHistoryDir(), id)));
    EXPECT_EQ(CInstallEvent(id).GetEventLogFile(),
              JoinPath(JoinPath(copy, id), "ORXInstallEvent.Log"));
    EXPECT_TRUE(FileExists(CInstallEvent(id).GetEventLogFile()));
  }
  const std::string first = FileText(CInstallEvent("1").GetEventLogFile());
  RunTool({"-logmessage", "1", "-message", "late"});  // its folder is not where it was
  RunTool({"-start", "1"});
  RunTool({"-end", "1", "-CopyName", "C1"});  // the target is there: the event stays
  EXPECT_EQ(FileText(JoinPath(JoinPath(copy, "1"), "ORXInstallEvent.Log")), first);
  EXPECT_EQ(CInstallEvent("1").GetEventLogFile(),
            JoinPath(JoinPath(GetHistoryDir(), "1"), "ORXInstallEvent.Log"));
}

TEST(InstallEvent, StaysInTheHistoryFolder) {
  const ScratchHistory scratch;
  RunTool({});
  const std::string outside = JoinPath(scratch.Root, "outside");
  std::filesystem::create_directory(outside);
  for (const std::string& hostile : std::vector<std::string>{
           "..", "../../outside", "../outside", "x/../../outside", ".. ", outside, "nowhere/1"}) {
    testing::internal::CaptureStdout();
    EXPECT_EQ(RunTool({"-start", hostile}), 0);
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              " Failed to create path:" + JoinPath(GetHistoryDir(), hostile));
    EXPECT_EQ(CInstallEvent(hostile).GetEventID(), hostile.substr(0, hostile.find(' ')));
    RunTool({"-start", "1"});
    RunTool({"-end", "1", "-CopyName", hostile});
    EXPECT_TRUE(DirExists(JoinPath(GetHistoryDir(), "1"))) << hostile;
  }
  EXPECT_TRUE(std::filesystem::is_empty(outside));
  for (const auto& entry : std::filesystem::directory_iterator(scratch.Root)) {
    EXPECT_TRUE(entry.path() == JoinPath(scratch.Root, "ZEK") || entry.path() == outside);
  }
}

TEST(InstallEvent, FailsWithoutItsFolders) {
  const ScratchHistory scratch;
  const std::string maker = JoinPath(scratch.Root, "ZEK");
  WriteFileText(maker, "a file");
=======
  scratch.Make("ZEK/ORXHistory");  // a file in the way
>>>>>>> tests1
  testing::internal::CaptureStdout();
  EXPECT_EQ(RunTool({"-start", "1"}), 1);
  EXPECT_EQ(scratch.Neutral(testing::internal::GetCapturedStdout()),
            " Failed to create path:@/ZEK/ORXHistoryInitialiation Failed:\n");
}

}  // namespace
