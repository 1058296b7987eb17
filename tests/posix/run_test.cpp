// The program as an installer runs it: whole processes over a scratch folder.

#include <gtest/gtest.h>
#include <sys/inotify.h>
#include <sys/stat.h>
#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

#include "platform/profile_text.h"
#include "tests/support/archive_reader.h"
#include "tests/support/scratch_folder.h"

namespace {

namespace fs = std::filesystem;
using namespace std::string_literals;

class Run : public testing::Test, protected ScratchFolder {
 protected:
  void SetUp() override {
    ::setenv("ORX_COMMON_APPDATA", Root.c_str(), /*overwrite=*/1);
    Make("ZEK/ORXHistory/");
  }

  // The result of a script, which runs in the scratch folder and ends at the first failure. It
  // finds the program as $ORX, which cannot wait for ever, as for the other end of a pipe.
  int Shell(const std::string& script) const {
    const std::string head = "set -e; cd " + Root + "; ORX='timeout 60 " ORX_PROGRAM "'; ";
    const int status = std::system((head + script).c_str());
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }

  // The program's result; its output goes to the file "output".
  int Call(const std::string& arguments) const { return Shell("$ORX " + arguments + " >output"); }

  ProfileText HistoryFile() const { return ProfileText(FileText(History + "History.ini")); }

  const std::string History = In("ZEK/ORXHistory/");
};

TEST_F(Run, GivesItsExitResults) {
  const std::string usage = "ORXInstallEvent";
  struct {
    const char* Arguments;
    int Result;
    std::string OutputBegin;  // what prints touches no history
  } const cases[] = {
      {"-help", 0, usage},     {"'/?'", 0, usage},      {"-report", 2, usage},
      {"-start 7", 0, ""},     {"-END 8 -x", 0, ""},    {"", 2, ""},
      {"--version", 0, usage}, {"--VERSION", 0, usage}, {"--version x", 2, ""},
      {"-help -x", 2, ""},     {"-report a b", 2, ""},  {"-REPORT a.zip", 3, "There is no ORX"},
  };
  for (const auto& [arguments, result, outputBegin] : cases) {
    fs::remove_all(Root + "/ZEK");
    EXPECT_EQ(Call(arguments), result) << arguments;
    EXPECT_EQ(FileText(Root + "/output").substr(0, usage.size()), outputBegin);
    EXPECT_EQ(fs::exists(History), outputBegin.empty());
  }
  WriteFileText(Root + "/ZEK", "a file in the way");
  EXPECT_EQ(Call("-start 7"), 1);
  EXPECT_EQ(FileText(Root + "/output"), "Initialiation Failed:\n");
}

TEST_F(Run, RecordsLocalTimes) {
  EXPECT_EQ(Shell("export TZ=Far-13; before=$(date '+%Y%m%d %H'); $ORX -start 7;"
                  "grep -e \"Start_Time=$before\" -e \"Start_Time=$(date '+%Y%m%d %H')\""
                  " ZEK/ORXHistory/History.ini"),
            0);
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
    WriteFileText(History + "History.ini", test.Text);
    EXPECT_EQ(Call("-start new -Type '\xC3\x28\xFF]=[x'"), 0);
    const ProfileText history = HistoryFile();
    EXPECT_EQ(history.Find("History", "Count"), test.Count);
    EXPECT_EQ(history.Find("new", "Type"), "\xC3\x28\xFF]=[x");
    EXPECT_EQ(history.SectionNames().size(), test.Sections);
  }
}

TEST_F(Run, LeavesAHistoryFileThatItCannotRead) {
  const char* cases[][2] = {{"mkdir -p History.ini/inside", "test -d History.ini/inside"},
                            {"echo '[Other]' >other; ln -s other History.ini",
                             "test -h History.ini -a $(cat other) = '[Other]'"},
                            {"mkfifo History.ini", "test -p History.ini"}};
  for (const auto& [before, after] : cases) {
    EXPECT_EQ(Shell("cd ZEK/ORXHistory; rm -rf *; " + std::string(before)), 0);
    EXPECT_EQ(Call("-start 1"), 0);
    EXPECT_EQ(Shell("cd ZEK/ORXHistory; " + std::string(after)), 0) << after;
  }
}

TEST_F(Run, NeitherFollowsNorPacksLinksAndPipes) {
  ASSERT_EQ(
      Shell("mkdir outside outside/7; echo untouched >outside/Summary.txt; echo log >setup.log;"
            "cd ZEK/ORXHistory; mkdir C2 C2/7 C2/7.log C2/C1; mkfifo pipe C2/Summary.txt;"
            "ln -s ../../outside C1; ln -s ../../outside/Summary.txt .; ln -s C2 loop;"
            "ln -s ../../../../outside/new.log C2/7.log/setup.log;"
            "ln -s ../../../outside/new.log C2/ORXInstallEvent.Log"),
      0);
  ASSERT_EQ(::mknod((History + "socket").c_str(), S_IFSOCK | 0600, 0), 0);
  const std::string log = "Log_File_Name=" + Root + "/setup.log\n";
  WriteFileText(History + "History.ini", "[7]\nCopy_Name=C1\n" + log + "[8]\nCopy_Name=C2/7\n" +
                                             log + "[7.log]\nCopy_Name=C2\n" + log);
  for (const std::string arguments : {"-start C1", "-start C2", "-start 9", "-end 9 -CopyName C1",
                                      "-end C1/7 -CopyName C2", "-report a.zip"}) {
    EXPECT_EQ(Call(arguments), 0);
  }
  EXPECT_EQ(ArchiveTree(Root + "/a.zip"),
            "9/\n9/ORXInstallEvent.Log\nC2/\nC2/7/\nC2/7/Summary.txt\nC2/7.log/\nC2/C1/\n"
            "History.ini\n");
  EXPECT_EQ(FileText(Root + "/outside/Summary.txt"), "untouched\n");
  EXPECT_EQ(fs::remove_all(Root + "/outside"), 3U);  // itself and what is made above
}

// Windows moves no folder in which a file is open.
TEST_F(Run, ClosesALogBeforeItIsMoved) {
  Call("-start 7");
  const int watch = ::inotify_init1(IN_NONBLOCK);
  ASSERT_GE(::inotify_add_watch(watch, (History + "7/ORXInstallEvent.Log").c_str(), IN_CLOSE_WRITE),
            0);
  ASSERT_GE(::inotify_add_watch(watch, History.c_str(), IN_MOVED_FROM | IN_ONLYDIR), 0);
  EXPECT_EQ(Call("-end 7 -CopyName C1"), 0);
  std::vector<uint32_t> events;
  alignas(inotify_event) char buffer[4096];
  const ssize_t size = ::read(watch, buffer, sizeof buffer);
  for (ssize_t offset = 0; offset < size;) {
    const auto* event = reinterpret_cast<const inotify_event*>(buffer + offset);
    if (event->len == 0 || std::string(event->name) == "7") {
      events.push_back(event->mask & (IN_CLOSE_WRITE | IN_MOVED_FROM));
    }
    offset += static_cast<ssize_t>(sizeof *event + event->len);
  }
  ::close(watch);
  EXPECT_EQ(events, (std::vector<uint32_t>{IN_CLOSE_WRITE, IN_MOVED_FROM}));
}

// The lock of the history file, which a report takes twice: when it has copied a file, and when it
// packs the history file.
TEST_F(Run, ReportsUnderTheLockOfTheHistoryFile) {
  const std::string log = "Log_File_Name=" + Root;
  WriteFileText(Root + "/setup.log", "log");
  WriteFileText(History + "History.ini", "[7]\nCopy_Name=C1\n" + log + "/setup.log\n");
  EXPECT_EQ(Shell("cd ZEK/ORXHistory; mkdir -p C1/7; exec 9<.; flock 9;"
                  "$ORX -report $OLDPWD/a.zip 9<&- & while ! [ -e C1/7/setup.log ]; do :; done;"
                  "sed -i s/setup.log/new.log/ History.ini; flock -u 9; wait $!"),
            0);
  EXPECT_EQ(HistoryFile().Find("7", "Log_File_Name"), Root + "/new.log");

  EXPECT_EQ(Shell("cd ZEK/ORXHistory; exec 9<.; flock 9; $ORX -report $OLDPWD/b.zip 9<&- &"
                  "sleep 0.5; test ! -e $OLDPWD/b.zip; flock -u 9; wait $!"),
            0);
}

}  // namespace
