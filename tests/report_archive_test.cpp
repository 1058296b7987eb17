#include <gtest/gtest.h>

#include <filesystem>
#include <iostream>
#include <sstream>
#include <string>

#include "app/install_history.h"
#include "history/locations.h"
#include "tests/archive_reader.h"
#include "tests/fake_machine.h"

namespace {

namespace fs = std::filesystem;

// What a report prints; its result must fit.
std::string Report(const std::string& archiveName, int result) {
  const std::ostringstream output;
  std::streambuf* console = std::cout.rdbuf(output.rdbuf());
  EXPECT_EQ(CInstallHistory().Report(archiveName), result) << archiveName;
  std::cout.rdbuf(console);
  return output.str();
}

std::string Created(const std::string& name) {
  return "The file '" + name + "' is created successfully\n";
}

TEST(Archive, HoldsTheWholeHistory) {
  const ScratchHistory scratch;
  const std::string archive = JoinPath(scratch.Root, "report.zip");
  const std::string log = JoinPath(scratch.Root, "setup.log");
  WriteFileText(log, std::string(5000, 'l'));
  RunTool({"-start", "8"});
  RunTool({"-start", "7"});
  RunTool({"-end", "7", "-CopyName", "C1", "-l", log});
  WriteFileText(JoinPath(GetHistoryDir(), ".History.tmp"), "not packed");

  EXPECT_EQ(Report(archive, 1), Created(archive));
  EXPECT_EQ(ArchiveNames(archive),
            std::vector<std::string>({"8", "8/ORXInstallEvent.Log", "C1", "C1/7",
                                      "C1/7/ORXInstallEvent.Log", "C1/7/setup.log",
                                      "C1/Summary.txt", "History.ini", "Summary.txt"}));
  const auto entries = ReadArchive(archive);
  for (const ArchiveEntry& entry : entries) {
    const std::string path = JoinPath(GetHistoryDir(), entry.Name);
    EXPECT_EQ((entry.Attributes & 0x10) != 0, DirExists(path)) << entry.Name;
    EXPECT_EQ(entry.Contents, FileExists(path) ? FileText(path) : "");
  }

  Report(archive, 1);
  EXPECT_EQ(ReadArchive(archive).size(), entries.size());
}

TEST(Archive, NeedsAHistoryFolderAndNoMore) {
  const ScratchHistory scratch;
  const std::string archive = JoinPath(scratch.Root, "report.zip");
  EXPECT_EQ(Report(archive, 0),
            "There is no ORX Installation History Log ( no ORX V9 or Later is installed )\n");
  EXPECT_FALSE(FileExists(archive));

  fs::create_directories(GetHistoryDir());
  EXPECT_EQ(Report(archive, 1), Created(archive));
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
    EXPECT_EQ(Report(name, 0), " Failed to create file '" + name + "'\n");
  }
  EXPECT_EQ(FileText(GetHistoryFilePath()), history);
}

}  // namespace
