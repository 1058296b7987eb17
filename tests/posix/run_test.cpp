// The program as an installer runs it: whole processes over a scratch folder.

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "platform/posix/profile_text.h"
#include "tests/archive_reader.h"

namespace {

namespace fs = std::filesystem;
using namespace std::string_literals;

std::string Text(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

void Write(const std::string& path, const std::string& text) {
  std::ofstream(path, std::ios::binary) << text;
}

class Run : public testing::Test {
 protected:
  void SetUp() override {
    char name[] = "/tmp/orx-run-XXXXXX";
    ASSERT_NE(::mkdtemp(name), nullptr);
    Root = name;
    ::setenv("ORX_COMMON_APPDATA", name, /*overwrite=*/1);
    History = Root + "/ZEK/ORXHistory/";
    fs::create_directories(History);
  }
  void TearDown() override { fs::remove_all(Root); }

  // The result of a command line for the shell. It finds the program as $ORX, and what it runs
  // cannot wait for ever, as for the other end of a pipe.
  static int Shell(const std::string& command) {
    const int status = std::system(("ORX='timeout 60 " ORX_PROGRAM "'; " + command).c_str());
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }

  // The program's result; its output goes to the file "output".
  int Call(const std::string& arguments) const {
    return Shell("$ORX " + arguments + " >" + Root + "/output");
  }

  ProfileText HistoryFile() const { return ProfileText(Text(History + "History.ini")); }

  std::string Root;
  std::string History;
};

TEST_F(Run, GivesItsExitResults) {
  const std::string usage = "ORXInstallEvent";
  struct {
    const char* Arguments;
    int Result;
    std::string OutputBegin;  // what prints touches no history
  } const cases[] = {
      {"-help", 0, usage}, {"'/?'", 0, usage},     {"-report", 2, usage},
      {"-start 7", 0, ""}, {"-END 8 -x", 0, ""},   {"", 2, ""},
      {"-help -x", 2, ""}, {"-report a b", 2, ""}, {"-REPORT a.zip", 3, "There is no ORX"},
  };
  for (const auto& [arguments, result, outputBegin] : cases) {
    fs::remove_all(Root + "/ZEK");
    EXPECT_EQ(Call(arguments), result) << arguments;
    EXPECT_EQ(Text(Root + "/output").substr(0, usage.size()), outputBegin);
    EXPECT_EQ(fs::exists(History), outputBegin.empty());
  }
  Write(Root + "/ZEK", "a file in the way");
  EXPECT_EQ(Call("-start 7"), 1);
  EXPECT_EQ(Text(Root + "/output"), "Initialiation Failed:\n");
}

TEST_F(Run, OverlappingStartsAllCount) {
  EXPECT_EQ(Shell("seq 200 | xargs -P 16 -I% $ORX -start % -Product P%"), 0);
  const ProfileText history = HistoryFile();
  EXPECT_EQ(history.Find("History", "Count"), "200");
  EXPECT_EQ(history.SectionNames().size(), 201U);
  for (int i = 1; i <= 200; ++i) {
    const std::string id = std::to_string(i);
    EXPECT_EQ(history.Find(id, "Event_ID"), id);
    EXPECT_EQ(history.Find(id, "Product"), "P" + id);
    EXPECT_TRUE(Text(History + id + "/ORXInstallEvent.Log")
                    .ends_with(" Starts  \n" + std::string(94, '*') + "\n"));
  }
}

TEST_F(Run, OverlappingMessagesStayWhole) {
  Call("-start 7");
  const std::string log = History + "7/ORXInstallEvent.Log";
  fs::resize_file(log, 0);
  std::string command;
  std::string expected;
  for (char c = 'a'; c <= 'z'; ++c) {
    const std::string message(20000, c);
    command += "$ORX -logmessage 7 -message " + message + " & ";
    expected += message + '\n';
  }
  Write(Root + "/messages", command + "wait\n");
  EXPECT_EQ(Shell(". " + Root + "/messages; sort -o " + log + ' ' + log), 0);
  EXPECT_EQ(Text(log), expected);
}

TEST_F(Run, SurvivesHistoryFilesOfAnyKind) {
  std::string many = "[History]\nCount=4\n";
  for (int i = 0; i < 100000; ++i) {
    many += "[" + std::to_string(i) + "]\n";
  }
  struct {
    std::string Text;
    const char* Count;
    size_t Sections;
  } const cases[] = {
      {"", "1", 2},
      {"[History]\nCount=4", "5", 2},
      {"\0\0[\0History]\0=\n"s, "1", 2},
      {"[History]\nCount=4\0\n[x\0]\nKey=\0\n"s, "5", 3},
      {"[History]\nCount=-3\nCount=9\n", "-2", 2},
      {"[History]\nCount=2147483647\n", "-2147483648", 2},
      {"[History]\nCount=many\n", "1", 2},
      {"\xFF\xFE[\0H\0"s, "1", 2},
      {many, "5", 100002},
  };
  for (const auto& test : cases) {
    Write(History + "History.ini", test.Text);
    EXPECT_EQ(Call("-start new -Type '\xC3\x28\xFF]=[x'"), 0);
    const ProfileText history = HistoryFile();
    EXPECT_EQ(history.Find("History", "Count"), test.Count);
    EXPECT_EQ(history.Find("new", "Type"), "\xC3\x28\xFF]=[x");
    EXPECT_EQ(history.SectionNames().size(), test.Sections);
  }
}

TEST_F(Run, LeavesAHistoryFileThatItCannotRead) {
  const std::string path = History + "History.ini";
  Write(Root + "/other.ini", "[Other]\nKey=1\n");
  fs::create_directories(path + "/inside");
  EXPECT_EQ(Call("-start 1"), 0);
  EXPECT_EQ(fs::remove_all(path), 2U);
  fs::create_symlink(Root + "/other.ini", path);
  EXPECT_EQ(Call("-start 1"), 0);
  EXPECT_TRUE(fs::is_symlink(path));
  EXPECT_EQ(Text(path), "[Other]\nKey=1\n");
  fs::remove(path);
  ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
  EXPECT_EQ(Call("-start 1"), 0);
  EXPECT_TRUE(fs::is_fifo(path));
}

TEST_F(Run, NeitherFollowsNorPacksLinksAndPipes) {
  const std::string outside = Root + "/outside";
  for (const std::string& folder : {outside + "/7", History + "C2/7", History + "C2/7.log"}) {
    fs::create_directories(folder);
  }
  Write(outside + "/Summary.txt", "untouched");
  Write(Root + "/setup.log", "log");
  fs::create_symlink(outside, History + "C1");
  fs::create_symlink(outside + "/Summary.txt", History + "Summary.txt");
  fs::create_symlink(outside + "/new.log", History + "C2/7.log/setup.log");
  fs::create_symlink(outside + "/new.log", History + "C2/ORXInstallEvent.Log");
  fs::create_symlink(History + "C2", History + "loop");
  ASSERT_EQ(::mkfifo((History + "C2/Summary.txt").c_str(), 0600), 0);
  ASSERT_EQ(::mkfifo((History + "pipe").c_str(), 0600), 0);
  ASSERT_EQ(::mknod((History + "socket").c_str(), S_IFSOCK | 0600, 0), 0);
  const std::string log = "Log_File_Name=" + Root + "/setup.log\n";
  Write(History + "History.ini", "[7]\nCopy_Name=C1\n" + log + "[8]\nCopy_Name=C2/7\n" + log +
                                     "[7.log]\nCopy_Name=C2\n" + log);
  for (const std::string arguments : {"-start C1", "-start C2", "-start 9", "-end 9 -CopyName C1",
                                      "-report $ORX_COMMON_APPDATA/a.zip"}) {
    EXPECT_EQ(Call(arguments), 0);
  }
  EXPECT_EQ(ArchiveTree(Root + "/a.zip"),
            "9/\n9/ORXInstallEvent.Log\nC2/\nC2/7/\nC2/7/Summary.txt\nC2/7.log/\nHistory.ini\n");
  EXPECT_EQ(Text(outside + "/Summary.txt"), "untouched");
  EXPECT_EQ(fs::remove_all(outside), 3U);  // itself and what is made above, nothing new
}

TEST_F(Run, TakesArgumentsOfAnyKind) {
  const std::string big(64 * 1024, 'v');
  const std::vector<std::string> identities = {
      "]", "=", "a=b", "[x]", "a\nb", "\t", "\xC3\x28\xFF", "a\\b", ";c", "\x01\x7F"};
  for (const std::string& id : identities) {
    const std::string quoted = " '" + id + "' ";
    EXPECT_EQ(Call("-start" + quoted + "-Path 'x\n[History]\nCount=99' -Command " + big), 0);
    EXPECT_EQ(Call("-logmessage" + quoted + "-message " + big), 0);
    EXPECT_EQ(Call("-end" + quoted + "-CopyName 'C" + id + "' -Result " + big), 0);
  }
  const ProfileText history = HistoryFile();
  EXPECT_EQ(history.Find("History", "Count"), std::to_string(identities.size()));
  for (std::string id : identities) {
    std::replace(id.begin(), id.end(), '\n', ' ');
    EXPECT_EQ(history.Find(id, "Command_Line"), big) << id;
    EXPECT_EQ(history.Find(id, "Path"), "x [History] Count=99") << id;
    EXPECT_EQ(history.Find(id, "Complete_Flag"), "TRUE") << id;
  }
}

}  // namespace
