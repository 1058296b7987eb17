// What a report does with things below the history folder that lead elsewhere or would hold it up.

#include <gtest/gtest.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "app/install_event.h"
#include "app/install_history.h"
#include "tests/archive_reader.h"

namespace {

namespace fs = std::filesystem;

class ReportLinks : public testing::Test {
 protected:
  void SetUp() override {
    char name[] = "/tmp/orx-links-XXXXXX";
    ASSERT_NE(::mkdtemp(name), nullptr);
    Root = name;
    History = Root + "/ZEK/ORXHistory/";
    ::setenv("ORX_COMMON_APPDATA", name, /*overwrite=*/1);
    fs::create_directories(History + "C2/7");
    fs::create_directories(Root + "/outside/7");
    std::ofstream(Root + "/outside/Summary.txt") << "untouched";
    std::ofstream(Root + "/setup.log") << "log";
    ::alarm(60);  // instead of waiting for the other end of a pipe
  }
  void TearDown() override {
    ::alarm(0);
    fs::remove_all(Root);
  }

  void AddEvent(const std::string& identity, const std::string& copyName) const {
    CInstallEvent event(identity);
    event.SetCopyName(copyName);
    event.SetLogFileName(Root + "/setup.log");
  }

  void BindSocket(const std::string& path) const {
    sockaddr_un address = {};
    address.sun_family = AF_UNIX;
    std::strncpy(address.sun_path, path.c_str(), sizeof address.sun_path - 1);
    const int socket = ::socket(AF_UNIX, SOCK_STREAM, 0);
    ASSERT_EQ(::bind(socket, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
    ::close(socket);
  }

  std::string Root;
  std::string History;
};

TEST_F(ReportLinks, AreNeitherFollowedNorPacked) {
  AddEvent("7", "C1");
  AddEvent("8", "C2/7");
  AddEvent("7.log", "C2");
  fs::create_symlink(Root + "/outside", History + "C1");
  fs::create_symlink(Root + "/outside/Summary.txt", History + "Summary.txt");
  fs::create_directories(History + "C2/7.log");
  fs::create_symlink(Root + "/outside/new.log", History + "C2/7.log/setup.log");
  ASSERT_EQ(::mkfifo((History + "C2/Summary.txt").c_str(), 0600), 0);
  ASSERT_EQ(::mkfifo((History + "pipe").c_str(), 0600), 0);
  BindSocket(History + "socket");
  fs::create_symlink(History + "C2", History + "loop");

  EXPECT_EQ(CInstallHistory().Report(Root + "/a.zip"), 1);
  EXPECT_EQ(
      ArchiveNames(Root + "/a.zip"),
      std::vector<std::string>({"C2", "C2/7", "C2/7/Summary.txt", "C2/7.log", "History.ini"}));
  std::vector<std::string> outside;
  for (const auto& entry : fs::recursive_directory_iterator(Root + "/outside")) {
    outside.push_back(entry.path().filename());
  }
  std::sort(outside.begin(), outside.end());
  EXPECT_EQ(outside, std::vector<std::string>({"7", "Summary.txt"}));
  std::string text;
  std::getline(std::ifstream(Root + "/outside/Summary.txt"), text);
  EXPECT_EQ(text, "untouched");
  EXPECT_EQ(CInstallEvent("7").GetLogFileName(), Root + "/setup.log");
  EXPECT_EQ(CInstallEvent("7.log").GetLogFileName(), Root + "/setup.log");
}

TEST_F(ReportLinks, LeadingToTheArchiveAreNotPackedEither) {
  AddEvent("7", "C2");
  std::ofstream(Root + "/a.zip") << "older";
  fs::create_hard_link(Root + "/a.zip", History + "C2/other name");
  EXPECT_EQ(CInstallHistory().Report(Root + "/a.zip"), 1);
  EXPECT_EQ(ArchiveNames(Root + "/a.zip"),
            std::vector<std::string>(
                {"C2", "C2/7", "C2/7/setup.log", "C2/Summary.txt", "History.ini", "Summary.txt"}));
}

}  // namespace
