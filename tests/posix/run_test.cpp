// The program as an installer runs it: whole processes over a scratch folder.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "platform/posix/profile_text.h"

namespace {

using Words = std::vector<std::string>;

class Run : public testing::Test {
 protected:
  void SetUp() override {
    char name[] = "/tmp/orx-run-XXXXXX";
    ASSERT_NE(::mkdtemp(name), nullptr);
    Root = name;
    ::setenv("ORX_COMMON_APPDATA", name, /*overwrite=*/1);
    History = Root + "/ZEK/ORXHistory";
  }
  void TearDown() override { std::filesystem::remove_all(Root); }

  // Starts the program; its output goes to the file "output".
  pid_t Start(Words words) const {
    words.insert(words.begin(), ORX_PROGRAM);
    std::vector<char*> pointers;
    for (std::string& word : words) {
      pointers.push_back(word.data());
    }
    pointers.push_back(nullptr);
    const pid_t child = ::fork();
    if (child == 0) {
      ::dup2(::open((Root + "/output").c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600), 1);
      ::execv(ORX_PROGRAM, pointers.data());
      ::_exit(127);
    }
    return child;
  }

  static int ResultOf(pid_t child) {
    int status = 0;
    ::waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }

  int Call(Words words) const { return ResultOf(Start(std::move(words))); }

  static std::string Text(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  }

  std::string Output() const { return Text(Root + "/output"); }
  std::string HistoryText() const { return Text(History + "/History.ini"); }

  std::string Root;
  std::string History;
};

TEST_F(Run, GivesItsExitResults) {
  const std::string usage = "ORXInstallEventLog.exe -start|-end|-loglessage [EventID] \n";
  struct {
    Words Arguments;
    int Result;
    std::string OutputBegin;
    bool TouchesHistory;
  } const cases[] = {
      {{"-help"}, 0, usage, false},   {{"/?"}, 0, usage, false},
      {{"-report"}, 2, usage, false}, {{}, 2, "", true},
      {{"-help", "-x"}, 2, "", true}, {{"-report", "a", "b"}, 2, "", true},
      {{"-start", "7"}, 0, "", true}, {{"-END", "8", "-unknown"}, 0, "", true},
  };
  for (const auto& test : cases) {
    std::filesystem::remove_all(Root + "/ZEK");
    EXPECT_EQ(Call(test.Arguments), test.Result);
    EXPECT_EQ(Output().substr(0, usage.size()), test.OutputBegin);
    EXPECT_EQ(std::filesystem::exists(History), test.TouchesHistory);
  }
  std::filesystem::remove_all(Root + "/ZEK");
  std::ofstream(Root + "/ZEK") << "a file in the way";
  EXPECT_EQ(Call({"-start", "7"}), 1);
  EXPECT_EQ(Output(), "Initialiation Failed:\n");
}

TEST_F(Run, OverlappingStartsAllCount) {
  constexpr int runs = 200;
  constexpr int atOnce = 16;
  std::vector<pid_t> children;
  for (int i = 0; i < runs; ++i) {
    if (children.size() == atOnce) {
      EXPECT_EQ(ResultOf(children.front()), 0);
      children.erase(children.begin());
    }
    children.push_back(Start({"-start", std::to_string(i), "-Product", "P" + std::to_string(i)}));
  }
  for (const pid_t child : children) {
    EXPECT_EQ(ResultOf(child), 0);
  }
  const ProfileText history(HistoryText());
  EXPECT_EQ(history.Find("History", "Count"), std::to_string(runs));
  EXPECT_EQ(history.SectionNames().size(), runs + 1U);
  for (int i = 0; i < runs; ++i) {
    const std::string id = std::to_string(i);
    EXPECT_EQ(history.Find(id, "Event_ID"), id);
    EXPECT_EQ(history.Find(id, "Product"), "P" + id);
    EXPECT_TRUE(Text(History + "/" + id + "/ORXInstallEvent.Log")
                    .ends_with(" Starts  \n" + std::string(94, '*') + "\n"));
  }
}

TEST_F(Run, OverlappingMessagesStayWhole) {
  Call({"-start", "7"});
  const std::string log = History + "/7/ORXInstallEvent.Log";
  const std::string before = Text(log);
  std::vector<pid_t> children;
  std::vector<std::string> expected;
  for (int i = 0; i < 24; ++i) {
    expected.emplace_back(20000, static_cast<char>('a' + i));
    children.push_back(Start({"-logmessage", "7", "-message", expected.back()}));
  }
  std::for_each(children.begin(), children.end(), [](pid_t child) { ResultOf(child); });
  std::ifstream file(log);
  file.seekg(static_cast<std::streamoff>(before.size()));
  std::vector<std::string> lines;
  for (std::string line; std::getline(file, line);) {
    lines.push_back(line);
  }
  std::sort(lines.begin(), lines.end());
  EXPECT_EQ(lines, expected);
}

TEST_F(Run, SurvivesHistoryFilesOfAnyKind) {
  const std::string path = History + "/History.ini";
  std::filesystem::create_directories(History);
  std::string many = "[History]\nCount=4\n";
  for (int i = 0; i < 100000; ++i) {
    many += "[" + std::to_string(i) + "]\n";
  }
  struct {
    std::string Text;
    std::string Count;
    size_t Sections;
  } const cases[] = {
      {"", "1", 2},
      {"[History]\nCount=4", "5", 2},
      {std::string("\0\0[\0History]\0=\n", 15), "1", 2},
      {std::string("[History]\nCount=4\0\n[x\0]\nKey=\0\n", 31), "5", 3},
      {"[History]\nCount=-3\nCount=9\n", "-2", 2},
      {"[History]\nCount=2147483647\n", "-2147483648", 2},
      {"[History]\nCount=many\n", "1", 2},
      {"\xFF\xFE[\0H\0", "1", 2},
      {many, "5", 100002},
  };
  for (const auto& test : cases) {
    std::ofstream(path, std::ios::binary) << test.Text;
    EXPECT_EQ(Call({"-start", "new", "-Type", "\xC3\x28\xFF]=[x"}), 0);
    const ProfileText history(HistoryText());
    EXPECT_EQ(history.Find("History", "Count"), test.Count);
    EXPECT_EQ(history.Find("new", "Type"), "\xC3\x28\xFF]=[x");
    EXPECT_EQ(history.SectionNames().size(), test.Sections);
  }
}

TEST_F(Run, LeavesAHistoryFileThatItCannotRead) {
  const std::string path = History + "/History.ini";
  std::filesystem::create_directories(path + "/inside");
  EXPECT_EQ(Call({"-start", "1"}), 0);
  EXPECT_TRUE(std::filesystem::is_directory(path + "/inside"));
  std::filesystem::remove_all(path);

  const std::string outside = Root + "/outside.ini";
  std::ofstream(outside) << "[Other]\nKey=1\n";
  std::filesystem::create_symlink(outside, path);
  EXPECT_EQ(Call({"-start", "1"}), 0);
  EXPECT_EQ(Text(outside), "[Other]\nKey=1\n");
  std::filesystem::remove(path);

  ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
  EXPECT_EQ(Call({"-start", "1"}), 0);
  EXPECT_TRUE(std::filesystem::is_fifo(path));
}

TEST_F(Run, WaitsForNoReaderOfALog) {
  Call({"-start", "1"});
  const std::string log = History + "/1/ORXInstallEvent.Log";
  std::filesystem::remove(log);
  ASSERT_EQ(::mkfifo(log.c_str(), 0600), 0);
  EXPECT_EQ(Call({"-logmessage", "1", "-message", "into a pipe"}), 0);
}

TEST_F(Run, FollowsNoLinkOutOfTheHistory) {
  const std::string outside = Root + "/outside";
  std::filesystem::create_directories(History);
  std::filesystem::create_directory(outside);
  std::filesystem::create_directory_symlink(outside, History + "/linked");
  std::filesystem::create_directory(History + "/7");
  std::filesystem::create_symlink(outside + "/log", History + "/7/ORXInstallEvent.Log");
  Call({"-start", "linked"});
  Call({"-start", "7"});
  Call({"-start", "8"});
  Call({"-end", "8", "-CopyName", "linked"});
  EXPECT_TRUE(std::filesystem::is_empty(outside));
  EXPECT_TRUE(std::filesystem::is_directory(History + "/8"));
}

TEST_F(Run, TakesArgumentsOfAnyKind) {
  const std::string big(64 * 1024, 'v');
  const Words identities = {"]",    "=",  "a=b",      "[x]",         "a\nb", "\t", "\xC3\x28\xFF",
                            "a\\b", ";c", "\x01\x7F", ".History.tmp"};
  for (const std::string& id : identities) {
    EXPECT_EQ(Call({"-start", id, "-Command", big, "-Path", "x\n[History]\nCount=99"}), 0);
    EXPECT_EQ(Call({"-logmessage", id, "-message", big}), 0);
    EXPECT_EQ(Call({"-end", id, "-CopyName", "C" + id, "-Result", big}), 0);
  }
  const ProfileText history(HistoryText());
  EXPECT_EQ(history.Find("History", "Count"), std::to_string(identities.size()));
  for (std::string id : identities) {
    std::replace(id.begin(), id.end(), '\n', ' ');
    EXPECT_EQ(history.Find(id, "Command_Line"), big) << id;
    EXPECT_EQ(history.Find(id, "Path"), "x [History] Count=99") << id;
    EXPECT_EQ(history.Find(id, "Complete_Flag"), "TRUE") << id;
  }
}

}  // namespace
