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

std::string InHistory(const std::string& folder, const std::string& name) {
  return JoinPath(InHistory(folder), name);
}

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
  std::filesystem::create_directories(InHistory(copyName, identity));
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
  event.SetEventLogFile(JoinPath(InHistory(copyName, identity), "ORXInstallEvent.Log"));
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
    EXPECT_EQ(TextOf(InHistory("C1", "Summary.txt")), Golden("summary_copy.txt"));
    EXPECT_TRUE(
        FileText(InHistory("no copy", "Summary.txt")).starts_with("ORX Installation Copy:no copy"));
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
  std::vector<std::pair<std::string, Names>> seen;
  for (const auto& group : groups) {
    seen.emplace_back(group->Name, Names());
    for (const CInstallEvent& event : group->Events) {
      seen.back().second.push_back(event.EventID);
    }
  }
  const std::vector<std::pair<std::string, Names>> expected = {
      {"(Unknown)", {"1"}}, {"B", {"2", "5"}}, {"A", {"Historyx", "8"}},
      {"4", {"4", "9"}},    {"b", {"6"}},      {"7", {"7"}},
  };
  EXPECT_EQ(seen, expected);
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
  std::filesystem::create_directory(InHistory("x", "Summary.txt"));

  EXPECT_EQ(CInstallHistory().WriteSummary(), 1);
  const std::string text = TextOf(InHistory("Summary.txt"));
  EXPECT_NE(text.find("  end of overall summary -"), std::string::npos);
  for (const std::string& name : copyNames) {
    EXPECT_NE(text.find("Copy Name       :" + Neutral(name, Scratch.Root) + "\n"),
              std::string::npos);
  }
  Names files;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(Scratch.Root)) {
    if (entry.is_regular_file()) {
      files.push_back(entry.path().filename().string());
    }
  }
  std::sort(files.begin(), files.end());
  EXPECT_EQ(files, Names({"History.ini", "Summary.txt"}));
}

TEST_F(Summary, ReadsOnlyAsManySectionsAsTheListHolds) {
  std::string text = "[History]\r\nCount=3000\r\n";
  for (int i = 1000; i < 4000; ++i) {
    text += "[" + std::to_string(i) + std::string(96, 'n') + "]\r\nCopy_Name=C\r\n";
  }
  WriteFileText(GetHistoryFilePath(), text);
  EXPECT_EQ(CInstallHistory().WriteSummary(), 1);
  // 8 bytes are those of "History", 101 those of each name. A last one of 29 bytes, cut short,
  // names no section and so an event without a copy.
  const std::string summary = FileText(InHistory("Summary.txt"));
  EXPECT_NE(summary.find("Total ORX Copies:2"), std::string::npos);
  EXPECT_NE(summary.find("Count of Events      :101"), std::string::npos);
  EXPECT_NE(summary.find("Copy:1101" + std::string(25, 'n')), std::string::npos);
}

}  // namespace
