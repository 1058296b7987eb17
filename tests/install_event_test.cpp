#include "app/install_event.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <vector>

#include "app/install_history.h"
#include "history/locations.h"
#include "tests/fake_machine.h"

namespace {

std::string HistoryText() { return FileText(GetHistoryFilePath()); }

TEST(InstallEvent, TakesOptionsFromTheCommandLine) {
  const ScratchHistory scratch;
  struct {
    std::vector<std::string> Words;
    const char* Mode;
    const char* EventID;
    const char* Field;  // the one that the case is about
    std::string CInstallEvent::*Place;
  } const cases[] = {
      {{}, "", "", "", &CInstallEvent::Type},
      {{"-LOGMESSAGE", "7", "-MESSAGE", "a b"}, "-logmessage", "7", "a b", &CInstallEvent::Message},
      {{"-InstallType", "GUI", "-end", "7"}, "-end", "7", "", &CInstallEvent::Type},
      {{"-Type", "GUI", "-end", "7"}, "-end", "7", "GUI", &CInstallEvent::Type},
      {{"-l", "-end", "7"}, "", "", "-end", &CInstallEvent::LogFile},
      {{"-start", "7", "-end", "8"}, "-end", "8", "", &CInstallEvent::LogFile},
      {{"-end", "7", "-u", "one", "-U", "two"}, "-end", "7", "two", &CInstallEvent::ResponseFile},
      {{"-end", "7", "-copyname"}, "-end", "7", "", &CInstallEvent::CopyName},
      {{"-end"}, "", "", "", &CInstallEvent::CopyName},
      {{"-end", ""}, "-end", "", "", &CInstallEvent::CopyName},
  };
  for (const auto& test : cases) {
    ProgramArguments arguments(test.Words);
    const CInstallEvent event(arguments.Count(), arguments.Vector());
    EXPECT_EQ(event.Mode, test.Mode);
    EXPECT_EQ(event.EventID, test.EventID);
    EXPECT_EQ(event.*test.Place, test.Field) << test.EventID;
    EXPECT_EQ(event.Valid, *test.Mode != '\0' && *test.EventID != '\0');
  }
  EXPECT_FALSE(DirExists(JoinPath(scratch.Root, "ZEK")));
}

TEST(InstallEvent, CountsStartsAlone) {
  const ScratchHistory scratch;
  EXPECT_EQ(RunTool({}), 2);
  EXPECT_EQ(HistoryText().substr(0, 9), "[History]");
  const std::pair<std::vector<std::string>, int> runs[] = {
      {{"-start", ""}, 0},       {{"-end", "1"}, 0},   {{"-start", "1"}, 1},
      {{"-logmessage", "2"}, 1}, {{"-START", "1"}, 2}, {{"-start", "2", "-end", "3"}, 2},
  };
  for (const auto& [words, count] : runs) {
    RunTool(words);
    EXPECT_EQ(CInstallHistory().EventCount, count);
  }
  std::filesystem::remove(GetHistoryFilePath());
  EXPECT_EQ(RunTool({}), 2);
  EXPECT_EQ(CInstallHistory().EventCount, 0);
}

TEST(InstallEvent, StoresWhatStartAndEndSay) {
  const ScratchHistory scratch;
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
  testing::internal::CaptureStdout();
  EXPECT_EQ(RunTool({"-start", "1"}), 1);
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "Initialiation Failed:\n");
  std::filesystem::remove(maker);
  std::filesystem::create_directory(maker);
  WriteFileText(JoinPath(maker, "ORXHistory"), "a file");
  testing::internal::CaptureStdout();
  EXPECT_EQ(RunTool({"-start", "1"}), 1);
  EXPECT_EQ(testing::internal::GetCapturedStdout(),
            " Failed to create path:" + JoinPath(maker, "ORXHistory") + "Initialiation Failed:\n");
}

}  // namespace
