// What a report makes of a history: summaries, the files that it collects, an archive.

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "app/install_history.h"
#include "history/locations.h"
#include "tests/support/archive_reader.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

namespace {

// A report's result and after it what it prints.
std::string Report(const std::string& archive) {
  testing::internal::CaptureStdout();
  CInstallHistory history;
  const int result = history.Report(archive);
  EXPECT_EQ(history.IsArchiveComplete, result == 1);
  return std::to_string(result) + testing::internal::GetCapturedStdout();
}

std::string Created(const std::string& archive) {
  return "1The file '" + archive + "' is created successfully\n";
}

TEST(Report, IsTheGoldenOneEveryTime) {
  const ScratchHistory scratch;
  for (const char* path :
       {"setup/Setup.log", "setup/Setup.rsp", "setup/Late.log", "setup/ORXInstallEvent.Log",
        "other/Setup.log", "Up.trc", "grandparent/", "outside/aside/", "outside/through/",
        "ZEK/ORXHistory/C1/11/ORXInstallEvent.Log", "ZEK/ORXHistory/C1/12/ORXInstallEvent.Log",
        "ZEK/ORXHistory/C1/12/Trial.log", "ZEK/ORXHistory/Nameless/",
        "ZEK/ORXHistory/X/Summary.txt/"}) {
    scratch.Make(path);
  }
  WriteFileText(GetHistoryFilePath(), scratch.Native(Golden("report_history.ini")));
  const std::string archive = scratch.In("report.zip");
  const std::filesystem::path before = std::filesystem::current_path();
  std::filesystem::current_path(scratch.In("setup"));
  for (int report = 0; report < 2; ++report) {
    EXPECT_EQ(Report(archive), Created(archive));
    EXPECT_EQ(scratch.Neutral(FileText(InHistory("Summary.txt"))), Golden("summary_overall.txt"));
    EXPECT_EQ(scratch.Neutral(FileText(InHistory("C1/Summary.txt"))), Golden("summary_copy.txt"));
    EXPECT_EQ(scratch.Tree(), Golden("report_files.txt"));
    EXPECT_EQ(ArchiveTree(archive), Golden("report_archive.txt"));
  }
  std::filesystem::current_path(before);
  EXPECT_EQ(FileText(InHistory("C1/11/Setup.log")), "setup/Setup.log");
  for (const ArchiveEntry& entry : ReadArchive(archive)) {
    const std::string path = InHistory(entry.Name);
    EXPECT_EQ(entry.Contents, FileExists(path) ? FileText(path) : "");
  }
}

TEST(Report, NeedsAHistoryFolderForItsArchiveAndAHistoryFileForItsSummary) {
  const ScratchHistory scratch;
  const std::string archive = scratch.In("report.zip");
  EXPECT_EQ(Report(archive),
            "0There is no ORX Installation History Log ( no ORX V9 or Later is installed )\n");
  EXPECT_EQ(scratch.Tree(), "");

  scratch.Make("ZEK/ORXHistory/Summary.txt");
  EXPECT_EQ(Report(archive), Created(archive));
  EXPECT_EQ(FileText(InHistory("Summary.txt")), "ZEK/ORXHistory/Summary.txt");
  EXPECT_EQ(CInstallHistory().WriteSummary(), 0);

  RunTool({});
  EXPECT_TRUE(FileExists('"' + GetHistoryFilePath() + '"'));
  EXPECT_TRUE(DirExists('"' + GetHistoryDir() + '"'));
  EXPECT_EQ(CInstallHistory().WriteSummary(), 1);
  EXPECT_EQ(scratch.Neutral(FileText(InHistory("Summary.txt"))), Golden("summary_empty.txt"));
}

TEST(Report, SumsUpEveryEventOfACopy) {
  const ScratchHistory scratch;
  std::string sections;
  for (int i = 100; i < 230; ++i) {
    sections += '[' + std::to_string(i) + "]\nCopy_Name=C1\nResult=" + std::to_string(i) + '\n';
  }
  scratch.Make("ZEK/ORXHistory/History.ini", sections);
  EXPECT_EQ(CInstallHistory().WriteSummary(), 1);
  const std::string summary = FileText(InHistory("Summary.txt"));
  for (int i = 100; i < 230; ++i) {
    EXPECT_NE(summary.find("\nResult          :" + std::to_string(i)), summary.npos) << i;
  }
}

TEST(Report, MakesNoArchiveUnderNamesThatAreTaken) {
  const ScratchHistory scratch;
  RunTool({"-start", "7"});
  const std::string before = FileText(GetHistoryFilePath());
  for (const std::string& name :
       {std::string(), scratch.Root, scratch.In("none/a.zip"), InHistory("7/../History.ini"),
        InHistory("Summary.txt"), InHistory("7/ORXInstallEvent.Log")}) {
    EXPECT_EQ(Report(name), "0 Failed to create file '" + name + "'\n");
  }
  EXPECT_EQ(FileText(GetHistoryFilePath()), before);
}

}  // namespace
