// The program as an installer runs it: processes over a scratch folder.

#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>
#include <string>

#include "platform/profile_text.h"
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

TEST_F(Run, ReturnsExitCodes) {
  const std::string usage = "ORXInstallEvent";
  // The arguments, the result and how the output begins. What prints touches no history.
  const std::tuple<const char*, int, std::string> cases[] = {
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
}

TEST_F(Run, RecordsLocalTimesAndAbsolutePaths) {
  EXPECT_EQ(Shell("export TZ=Far-13 ORX_COMMON_APPDATA=.; before=$(date '+%Y%m%d %H:%M');"
                  "$ORX -start 7; grep -q \"Event_Log_File=$PWD/\" ZEK/ORXHistory/History.ini;"
                  "grep -e \"Start_Time=$before\" -e \"Start_Time=$(date '+%Y%m%d %H:%M')\""
                  " ZEK/ORXHistory/History.ini"),
            0);
}

TEST_F(Run, AcceptsAnyHistoryFile) {
  // The text, the count after a start and the number of sections.
  const std::tuple<std::string, const char*, size_t> cases[] = {
      {"", "1", 2},
      {"[History]\nCount=4", "5", 2},
      {"\0\0[\0History]\0=\n"s, "1", 2},
      {"[History]\nCount=4\0\n[x\0]\nKey=\0\n"s, "5", 3},
      {"[History]\nCount=-3\nCount=9\n", "-2", 2},
      {"[History]\nCount=2147483647\n", "-2147483648", 2},
      {"[History]\nCount=many\n", "1", 2},
      {"\xFF\xFE[\0H\0"s, "1", 2},
  };
  for (const auto& [text, count, sections] : cases) {
    WriteFileText(History + "History.ini", text);
    EXPECT_EQ(Call("-start new -Type '\xC3\x28\xFF]=[x'"), 0);
    const ProfileText history = HistoryFile();
    EXPECT_EQ(history.Find("History", "Count"), count);
    EXPECT_EQ(history.Find("new", "Type"), "\xC3\x28\xFF]=[x");
    EXPECT_EQ(history.SectionNames().size(), sections);
  }
}

// More entries than other programs can read are left out: then the archive is not complete.
TEST_F(Run, FailsWhenTheArchiveIsFull) {
  EXPECT_EQ(Shell("memory=$(mktemp -d -p /dev/shm);"  // as so many files take long on a disk
                  "trap 'rm -r $memory' EXIT; mkdir -p $memory/ZEK/ORXHistory/folder;"
                  "(cd $memory/ZEK/ORXHistory/folder; seq 65535 | xargs touch);"
                  "ORX_COMMON_APPDATA=$memory $ORX -report a.zip >output"),
            3);
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
