#include "app/install_event.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <sstream>
#include <vector>

#include "app/install_history.h"
#include "app/usage.h"
#include "eventlog/logger.h"
#include "history/locations.h"
#include "tests/support/fake_machine.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

namespace {

using Words = std::vector<std::string>;

TEST(InstallEvent, TakesOptionsFromTheCommandLine) {
  const ScratchHistory scratch;
  // A command line, split at its blanks, and its kind, identity, -l, -u, -Type and -message.
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
    std::istringstream words(commandLine);
    ProgramArguments arguments({std::istream_iterator<std::string>(words), {}});
    const CInstallEvent event(arguments.Count(), arguments.Vector());
    EXPECT_EQ(event.Valid, !event.Mode.empty()) << commandLine;
    EXPECT_EQ(event.Mode + ',' + event.EventID + ',' + event.LogFile + ',' + event.ResponseFile +
                  ',' + event.Type + ',' + event.Message,
              parsed);
  }
  EXPECT_EQ(scratch.Tree(), "");
}

TEST(InstallEvent, PrintsItsUsageAndItsHelp) {
  testing::internal::CaptureStdout();
  PrintUsage();
  std::cout << '|';
  PrintHelp();
  EXPECT_EQ(testing::internal::GetCapturedStdout(), Golden("usage.txt") + '|' + Golden("help.txt"));
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
  return Replaced(scratch.Neutral(FileText(GetHistoryFilePath())), "\n\n", "\n");
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
  // An existing file keeps its count, even none.
  WriteFileText(GetHistoryFilePath(), "[1]\nResult=\n");
  RunTool({"-logmessage", "1"});
  EXPECT_EQ(HistoryText(scratch), "[1]\nResult=\n");
}

// A snapshot can take seconds: until then other runs must neither wait nor lose their messages.
TEST(InstallEvent, HasRecordedItsStartBeforeTheSnapshot) {
  const ScratchHistory scratch;
  std::string during;
  Machine().OnServices = [&](std::chrono::milliseconds limit) {
    EXPECT_EQ(limit, std::chrono::seconds(2));
    during = HistoryText(scratch);
    std::ofstream(InHistory("1/ORXInstallEvent.Log"), std::ios::app) << "of another run\n";
  };
  EXPECT_EQ(RunTool({"-start", "1"}), 0);
  EXPECT_EQ(during, HistoryText(scratch));
  const std::string log = scratch.Neutral(FileText(InHistory("1/ORXInstallEvent.Log")));
  EXPECT_NE(log.find("\nof another run\n"), log.npos);
}

// Changes the history file when a text is flushed, and keeps what is in it then: under a guard, not
// the change.
struct GuardProbe : std::stringbuf {
  int sync() override {
    CIniFile(GetHistoryFilePath()).WriteString("Probe", "Key", "");
    History = FileText(GetHistoryFilePath());
    return 0;
  }
  std::string History = "not flushed";
};

TEST(InstallEvent, AddsAMessageUnderTheGuard) {
  const ScratchHistory scratch;
  scratch.Make("ZEK/ORXHistory/1/");
  GuardProbe probe;
  std::ios& log = CLogger::GetInstance();
  std::streambuf* file = log.rdbuf(&probe);
  EXPECT_EQ(RunTool({"-logmessage", "1", "-message", "m"}), 0);
  log.rdbuf(file);
  EXPECT_EQ(probe.str() + scratch.Neutral(probe.History), "m\n[History]\nCount=0\n");
}

TEST(InstallEvent, HasNamesThatLeadElsewhere) {
  const ScratchHistory scratch;
  for (const char* name : {"..", "...", ". . .", "a/.. /b", "a/..", ".... "}) {
    EXPECT_TRUE(LeadsElsewhere(scratch.Native(name))) << name;
  }
  for (const char* name : {".", "a/.b", "a.b.c/d"}) {
    EXPECT_FALSE(LeadsElsewhere(scratch.Native(name))) << name;
  }
}

TEST(InstallEvent, FailsWithoutTheHistoryFolder) {
  const ScratchHistory scratch;
  scratch.Make("ZEK/ORXHistory");  // a file in the way
  testing::internal::CaptureStdout();
  EXPECT_EQ(RunTool({"-start", "1"}), 1);
  EXPECT_EQ(scratch.Neutral(testing::internal::GetCapturedStdout()),
            " Failed to create path:@/ZEK/ORXHistoryInitialiation Failed:\n");
}

}  // namespace
