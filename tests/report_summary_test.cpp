#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "app/install_event.h"
#include "app/install_history.h"
#include "history/ini_file.h"
#include "history/locations.h"
#include "platform/path.h"
#include "report/copy_events.h"
#include "tests/fake_machine.h"

namespace {

using Names = std::vector<std::string>;

std::string InHistory(const std::string& name) { return JoinPath(GetHistoryDir(), name); }

// The text with "@" for the scratch folder, with slashes and plain line ends.
std::string Neutral(std::string text, const std::string& root) {
  std::erase(text, '\r');
  for (size_t place = 0; (place = text.find(root, place)) != std::string::npos;) {
    text.replace(place, root.size(), "@");
  }
  std::replace(text.begin(), text.end(), kPathSeparator, '/');
  return text;
}

std::string Golden(const std::string& name) {
  return FileText(std::string(ORX_GOLDEN_FOLDER) + "/" + name);
}

class Summary : public testing::Test {
 protected:
  void SetUp() override { std::filesystem::create_directories(GetHistoryDir()); }

  std::string TextOf(const std::string& path) const {
    return Neutral(FileText(path), Scratch.Root);
  }

  const ScratchHistory Scratch;
};

void AddFinishedEvent(const std::string& identity, const std::string& copyName) {
  std::filesystem::create_directories(InHistory(JoinPath(copyName, identity)));
  CInstallEvent event(identity);
  event.SetEventID(identity);
  event.SetCommandLine("not printed");
  event.SetStartTime("20261124 21:05:07");
  event.SetEndTime("20261124 21:09:41");
  event.SetType("GUI");
  event.SetProduct("Server " + identity);
  event.SetVersion("9.1");
  event.SetServiceLevel("SP2");
  event.SetPath(std::string(300, 'p'));
  event.SetCopyName(copyName);
  event.SetEventLogFile(JoinPath(InHistory(JoinPath(copyName, identity)), "ORXInstallEvent.Log"));
  event.SetResult("Success");
}

TEST_F(Summary, IsTheSameAtEveryReport) {
  CIniFile(GetHistoryFilePath()).WriteString("History", "Count", "77");
  AddFinishedEvent("11", "C1");
  CInstallEvent("started").SetCopyName("(Unknown)");
  AddFinishedEvent("12", "C1");
  CInstallEvent("no copy").SetCopyName("");
  std::filesystem::create_directory(InHistory("no copy"));
  const std::string installerLog = JoinPath(Scratch.Root, "setup.log");
  WriteFileText(installerLog, "log");
  CInstallEvent("12").SetLogFileName(installerLog);
  CInstallEvent("12").SetTraceFile("gone.trc");

  for (int report = 0; report < 2; ++report) {
    EXPECT_EQ(CInstallHistory().WriteSummary(), 1);
    EXPECT_EQ(TextOf(InHistory("Summary.txt")), Golden("summary_overall.txt"));
    EXPECT_EQ(TextOf(InHistory(JoinPath("C1", "Summary.txt"))), Golden("summary_copy.txt"));
    EXPECT_TRUE(FileText(InHistory(JoinPath("no copy", "Summary.txt")))
                    .starts_with("ORX Installation Copy:no copy"));
    EXPECT_FALSE(DirExists(InHistory("(Unknown)")));
  }
}

TEST_F(Summary, NeedsAHistoryFile) {
  WriteFileText(InHistory("Summary.txt"), "older");
  EXPECT_EQ(CInstallHistory().WriteSummary(), 0);
  EXPECT_EQ(FileText(InHistory("Summary.txt")), "older");

  CIniFile(GetHistoryFilePath()).WriteString("History", "Count", "3");
  EXPECT_EQ(CInstallHistory().WriteSummary(), 1);
  EXPECT_EQ(TextOf(InHistory("Summary.txt")), Golden("summary_empty.txt"));
}

TEST_F(Summary, GroupsByCopyInTheOrderOfFirstEvents) {
  const std::pair<const char*, const char*> events[] = {
      {"History", "none"}, {"1", "(Unknown)"}, {"2", "B"}, {"Historyx", "A"}, {"4", ""},
      {"5", "B"},          {"6", "b"},         {"7", ""},  {"8", "A"},        {"9", "4"},
  };
  for (const auto& [identity, copyName] : events) {
    CInstallEvent(identity).SetCopyName(copyName);
  }
  const CInstallHistory history;
  std::vector<std::unique_ptr<CCopyEvents>> groups;
  history.GroupEvents(history.GetEventSections(), groups);
  std::string seen;
  for (const auto& group : groups) {
    seen += group->Name + ':';
    for (const CInstallEvent& event : group->Events) {
      seen += ' ' + event.EventID;
    }
    seen += '\n';
  }
  EXPECT_EQ(seen, "(Unknown): 1\nB: 2 5\nA: Historyx 8\n4: 4 9\nb: 6\n7: 7\n");
}

TEST_F(Summary, KeepsToTheHistoryFolderWhateverACopyIsCalled) {
  const std::string up = std::string("..") + kPathSeparator;
  const std::string outside = JoinPath(Scratch.Root, "outside");
  std::filesystem::create_directory(outside);
  std::filesystem::create_directories(InHistory("x"));
  const Names copyNames = {"..",
                           up + ".." + kPathSeparator + "outside",
                           JoinPath("x", up + ".."),
                           outside,
                           ".",
                           JoinPath("x", "none"),
                           "History.ini",
                           "x"};
  for (const std::string& name : copyNames) {
    CInstallEvent("of " + name).SetCopyName(name);
  }
  std::filesystem::create_directory(InHistory(JoinPath("x", "Summary.txt")));

  EXPECT_EQ(CInstallHistory().WriteSummary(), 1);
  const std::string text = TextOf(InHistory("Summary.txt"));
  EXPECT_NE(text.find("  end of overall summary -"), std::string::npos);
  for (const std::string& name : copyNames) {
    EXPECT_NE(text.find("Copy Name       :" + Neutral(name, Scratch.Root) + "\n"),
              std::string::npos);
  }
  int files = 0;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(Scratch.Root)) {
    files += entry.is_regular_file() ? 1 : 0;
  }
  EXPECT_EQ(files, 2);  // the history file and the overall summary
}

}  // namespace
