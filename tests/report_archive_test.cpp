#include <gtest/gtest.h>

#include <filesystem>
#include <iostream>
#include <sstream>
#include <string>

#include "app/install_event.h"
#include "app/install_history.h"
#include "history/ini_file.h"
#include "history/locations.h"
#include "tests/archive_reader.h"
#include "tests/fake_machine.h"

namespace {

namespace fs = std::filesystem;

struct Outcome {
  int Result = 0;
  std::string Output;
};

Outcome Report(const std::string& archiveName) {
  const std::ostringstream output;
  std::streambuf* console = std::cout.rdbuf(output.rdbuf());
  const int result = CInstallHistory().Report(archiveName);
  std::cout.rdbuf(console);
  return {result, output.str()};
}

std::string Created(const std::string& name) {
  return "The file '" + name + "' is created successfully\n";
}

std::string Failed(const std::string& name) { return " Failed to create file '" + name + "'\n"; }

TEST(Archive, HoldsTheWholeHistory) {
  const ScratchHistory scratch;
  const std::string archive = JoinPath(scratch.Root, "report.zip");
  const std::string log = JoinPath(scratch.Root, "setup.log");
  WriteFileText(log, std::string(5000, 'l'));
  RunTool({"-start", "8"});
  RunTool({"-start", "7"});
  RunTool({"-end", "7", "-CopyName", "C1", "-l", log});
  WriteFileText(JoinPath(GetHistoryDir(), ".History.tmp"), "not packed");

  const Outcome first = Report(archive);
  EXPECT_EQ(first.Result, 1);
  EXPECT_EQ(first.Output, Created(archive));
  const auto entries = ReadArchive(archive);
  const std::vector<std::string> names = {"8",
                                          "8/ORXInstallEvent.Log",
                                          "C1",
                                          "C1/7",
                                          "C1/7/ORXInstallEvent.Log",
                                          "C1/7/setup.log",
                                          "C1/Summary.txt",
                                          "History.ini",
                                          "Summary.txt"};
  EXPECT_EQ(ArchiveNames(archive), names);
  for (const ArchiveEntry& entry : entries) {
    const std::string path = JoinPath(GetHistoryDir(), entry.Name);
    EXPECT_EQ((entry.Attributes & 0x10) != 0, DirExists(path)) << entry.Name;
    EXPECT_EQ(entry.Contents, FileExists(path) ? FileText(path) : "");
  }

  EXPECT_EQ(Report(archive).Result, 1);
  EXPECT_EQ(ReadArchive(archive).size(), entries.size());
}

TEST(Archive, NeedsAHistoryFolderAndNoMore) {
  const ScratchHistory scratch;
  const std::string archive = JoinPath(scratch.Root, "report.zip");
  const Outcome none = Report(archive);
  EXPECT_EQ(none.Result, 0);
  EXPECT_EQ(none.Output,
            "There is no ORX Installation History Log ( no ORX V9 or Later is installed )\n");
  EXPECT_FALSE(FileExists(archive));

  fs::create_directories(GetHistoryDir());
  EXPECT_EQ(Report(archive).Output, Created(archive));
  EXPECT_TRUE(ReadArchive(archive).empty());
}

TEST(Archive, IsNotCreatedUnderNamesThatAreTaken) {
  const ScratchHistory scratch;
  RunTool({"-start", "7"});
  const std::string history = FileText(GetHistoryFilePath());
  const std::string other = JoinPath(JoinPath(GetHistoryDir(), "7"), "..");
  for (const std::string& name :
       {std::string(), scratch.Root, JoinPath(JoinPath(scratch.Root, "none"), "a.zip"),
        GetHistoryFilePath(), JoinPath(other, "History.ini")}) {
    const Outcome outcome = Report(name);
    EXPECT_EQ(outcome.Result, 0) << name;
    EXPECT_EQ(outcome.Output, Failed(name));
  }
  EXPECT_EQ(FileText(GetHistoryFilePath()), history);
}

TEST(Archive, DoesNotHoldItself) {
  const ScratchHistory scratch;
  RunTool({"-start", "7"});
  const fs::path before = fs::current_path();
  fs::current_path(GetHistoryDir());
  const Outcome outcome = Report("7/a.zip");
  fs::current_path(before);
  EXPECT_EQ(outcome.Output, Created("7/a.zip"));
  const std::string archive = JoinPath(JoinPath(GetHistoryDir(), "7"), "a.zip");
  EXPECT_EQ(ArchiveNames(archive),
            std::vector<std::string>({"7", "7/ORXInstallEvent.Log", "History.ini", "Summary.txt"}));
}

}  // namespace
