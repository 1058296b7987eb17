#include "app/install_event.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <vector>

#include "history/locations.h"
#include "tests/fake_machine.h"

namespace {

using Words = std::vector<std::string>;

TEST(InstallEvent, TakesOptionsFromTheCommandLine) {
  const ScratchHistory scratch;
  struct {
    Words Arguments;
    const char* Mode;
    const char* EventID;
    const char* Field;  // the one that the case is about
    std::string CInstallEvent::*Place;
  } const cases[] = {
      {{}, "", "", "", &CInstallEvent::Type},
      {{"-LOGMESSAGE", "7", "-MESSAGE", "a b"}, "-logmessage", "7", "a b", &CInstallEvent::Message},
      {{"-InstallType", "GUI", "-end", "7"}, "-end", "7", "", &CInstallEvent::Type},
      {{"-l", "-end", "7"}, "", "", "-end", &CInstallEvent::LogFile},
      {{"-start", "7", "-end", "8"}, "-end", "8", "", &CInstallEvent::LogFile},
      {{"-end", "7", "-u", "one", "-U", "two"}, "-end", "7", "two", &CInstallEvent::ResponseFile},
      {{"-end", "7", "-copyname"}, "-end", "7", "", &CInstallEvent::CopyName},
      {{"-end"}, "", "", "", &CInstallEvent::CopyName},
      {{"-end", ""}, "-end", "", "", &CInstallEvent::CopyName},
  };
  for (const auto& test : cases) {
    ProgramArguments arguments(test.Arguments);
    const CInstallEvent event(arguments.Count(), arguments.Vector());
    EXPECT_EQ(event.Mode, test.Mode);
    EXPECT_EQ(event.EventID, test.EventID);
    EXPECT_EQ(event.*test.Place, test.Field) << test.EventID;
    EXPECT_EQ(event.Valid, *test.Mode != '\0' && *test.EventID != '\0');
  }
  EXPECT_EQ(scratch.Tree(), "");
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
  std::string text = scratch.Neutral(FileText(GetHistoryFilePath()));
  for (size_t place = 0; (place = text.find("\n\n")) != std::string::npos;) {
    text.erase(place, 1);
  }
  return text;
}

TEST(InstallEvent, KeepsTheGoldenHistory) {
  const ScratchHistory scratch;
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
  };
  for (const Words& words : runs) {
    EXPECT_EQ(RunTool(words), 0);
  }
  // What comes later finds no folder; then a folder of its own, but the target taken.
  const std::string first = FileText(InHistory("C1/again/ORXInstallEvent.Log"));
  RunTool({"-logmessage", "again", "-message", "late"});
  for (int start = 0; start < 2; ++start) {
    RunTool({"-start", "again"});
  }
  RunTool(endOfAgain);
  EXPECT_EQ(HistoryText(scratch) + scratch.Tree(), Golden("event_history.txt"));
  EXPECT_EQ(FileText(InHistory("C1/again/ORXInstallEvent.Log")), first);
  const std::string second = FileText(InHistory("again/ORXInstallEvent.Log"));
  EXPECT_EQ(second.rfind("---------- ORX Installation History Logger ( Start )"), 0U);

  std::filesystem::remove(GetHistoryFilePath());
  EXPECT_EQ(RunTool({}), 2);
  EXPECT_EQ(HistoryText(scratch), "[History]\nCount=0\n");
}

TEST(InstallEvent, StaysInTheHistoryFolder) {
  const ScratchHistory scratch;
  scratch.Make("outside/");
  RunTool({"-start", "1"});
  const std::string before = scratch.Tree();
  for (const std::string& hostile : Words{"..", "../../outside", "../outside", "x/../../outside",
                                          ".. ", scratch.In("outside"), "nowhere/1"}) {
    testing::internal::CaptureStdout();
    EXPECT_EQ(RunTool({"-start", hostile}), 0);
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              " Failed to create path:" + JoinPath(GetHistoryDir(), hostile));
    EXPECT_EQ(CInstallEvent(hostile).GetEventID(), hostile.substr(0, hostile.find(' ')));
    RunTool({"-end", "1", "-CopyName", hostile});
    EXPECT_EQ(scratch.Tree(), before) << hostile;
  }
}

TEST(InstallEvent, FailsWithoutItsFolders) {
  const ScratchHistory scratch;
  for (const std::string folder : {"ZEK", "ZEK/ORXHistory"}) {
    std::filesystem::remove(scratch.In("ZEK"));
    scratch.Make(folder);
    testing::internal::CaptureStdout();
    EXPECT_EQ(RunTool({"-start", "1"}), 1);
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              (folder == "ZEK" ? "" : " Failed to create path:" + scratch.In(folder)) +
                  "Initialiation Failed:\n");
  }
}

}  // namespace
