// What a report does with things below the history folder that lead elsewhere or would hold it up.

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include "app/install_event.h"
#include "app/install_history.h"
#include "tests/archive_reader.h"

namespace {

namespace fs = std::filesystem;

TEST(ReportLinks, AreNeitherFollowedNorPacked) {
  char name[] = "/tmp/orx-links-XXXXXX";
  ASSERT_NE(::mkdtemp(name), nullptr);
  const std::string root = name;
  const std::string history = root + "/ZEK/ORXHistory/";
  ::setenv("ORX_COMMON_APPDATA", name, /*overwrite=*/1);
  fs::create_directories(history + "C2/7");
  fs::create_directories(history + "C2/7.log");
  fs::create_directories(root + "/outside/7");
  std::ofstream(root + "/outside/Summary.txt") << "untouched";
  std::ofstream(root + "/setup.log") << "log";
  const std::pair<const char*, const char*> events[] = {
      {"7", "C1"}, {"8", "C2/7"}, {"7.log", "C2"}};
  for (const auto& [identity, copyName] : events) {
    CInstallEvent event(identity);
    event.SetCopyName(copyName);
    event.SetLogFileName(root + "/setup.log");
  }
  fs::create_symlink(root + "/outside", history + "C1");
  fs::create_symlink(root + "/outside/Summary.txt", history + "Summary.txt");
  fs::create_symlink(root + "/outside/new.log", history + "C2/7.log/setup.log");
  fs::create_symlink(history + "C2", history + "loop");
  ASSERT_EQ(::mkfifo((history + "C2/Summary.txt").c_str(), 0600), 0);
  ASSERT_EQ(::mkfifo((history + "pipe").c_str(), 0600), 0);
  ASSERT_EQ(::mknod((history + "socket").c_str(), S_IFSOCK | 0600, 0), 0);

  ::alarm(60);  // ends a run that waits for the other end of a pipe
  EXPECT_EQ(CInstallHistory().Report(root + "/a.zip"), 1);
  ::alarm(0);
  EXPECT_EQ(
      ArchiveTree(root + "/a.zip"),
      std::vector<std::string>({"C2", "C2/7", "C2/7/Summary.txt", "C2/7.log", "History.ini"}));
  EXPECT_EQ(fs::file_size(root + "/outside/Summary.txt"), 9U);
  EXPECT_FALSE(fs::exists(root + "/outside/new.log"));
  EXPECT_TRUE(fs::is_empty(root + "/outside/7"));
  EXPECT_EQ(CInstallEvent("7").GetLogFileName(), root + "/setup.log");
  EXPECT_EQ(CInstallEvent("7.log").GetLogFileName(), root + "/setup.log");
  fs::remove_all(root);
}

}  // namespace
