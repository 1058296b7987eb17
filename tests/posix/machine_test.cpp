// The limits of what the program reads of a machine, with the values of other machines.

#include <gtest/gtest.h>
#include <sched.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>

#include "platform/computer.h"
#include "platform/posix/child_output.h"
#include "platform/posix/process_folder.h"
#include "platform/posix/text_file.h"
#include "tests/support/file_text.h"

namespace {

// The short name of a machine with that host name, or "none".
std::string ShortNameOf(const std::string& hostName) {
  return ChildOutput(
      [&](const Descriptor& output) {
        const bool isAllowed =
            ::unshare(CLONE_NEWUTS) == 0 || ::unshare(CLONE_NEWUSER | CLONE_NEWUTS) == 0;
        if (isAllowed && ::sethostname(hostName.c_str(), hostName.size()) == 0) {
          WriteAll(output, ShortComputerName().value_or("none"));
        }
      },
      std::chrono::seconds(20));
}

TEST(Machine, HasAShortNameOfAtMost14Characters) {
  if (ShortNameOf("a").empty()) {
    GTEST_SKIP() << "needs the right to create a namespace";
  }
  for (const auto& [hostName, name] :
       {std::pair("fourteen-bytes", "fourteen-bytes"), std::pair("fifteen-bytes--", "none"),
        std::pair("fourteen-bytes.domain", "fourteen-bytes"), std::pair(".domain", "none")}) {
    EXPECT_EQ(ShortNameOf(hostName), name);
  }
}

TEST(Machine, HasAtMost8192Processes) {
  char folder[] = "/dev/shm/orx-test-XXXXXX";  // in memory, as so many entries take long on a disk
  ASSERT_NE(::mkdtemp(folder), nullptr);
  const auto make = [&](const std::string& name) { WriteFileText(folder + ('/' + name), ""); };
  for (const char* name : {"1x", "self", "4294967296", "4294967295"}) {
    make(name);
  }
  EXPECT_EQ(ListNumbers(folder).value(), std::vector<uint32_t>{4294967295U});
  for (int i = 1; i <= 8192; ++i) {
    make(std::to_string(i));
  }
  std::vector<uint32_t> numbers = ListNumbers(folder).value();
  std::filesystem::remove_all(folder);
  EXPECT_EQ(numbers.size(), 8192U);
  std::sort(numbers.begin(), numbers.end());
  EXPECT_EQ(std::unique(numbers.begin(), numbers.end()), numbers.end());
  EXPECT_FALSE(ListNumbers(folder));
}

TEST(Machine, NamesAnExecutableByItsFile) {
  const std::string longest(259, 'n');
  const std::pair<std::string, std::string> cases[] = {{"/usr/bin/tool", "tool"},
                                                       {"/usr/bin/tool (deleted)", "tool"},
                                                       {"/a (deleted)/tool", "tool"},
                                                       {"/x (deleted) (deleted)", "x (deleted)"},
                                                       {"tool", "tool"},
                                                       {"/a/" + longest, longest},
                                                       {"/a/" + longest + "n", longest}};
  for (const auto& [link, name] : cases) {
    EXPECT_EQ(ExecutableName(link), name);
  }
}

}  // namespace
