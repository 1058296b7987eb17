// What the program reads of a machine, with the values of other machines.

#include <gtest/gtest.h>
#include <sched.h>
#include <unistd.h>

#include <climits>
#include <cstdlib>
#include <filesystem>
#include <regex>
#include <set>

#include "platform/computer.h"
#include "platform/posix/child_output.h"
#include "platform/posix/process_folder.h"
#include "platform/posix/text_file.h"
#include "tests/support/scratch_folder.h"

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
  const std::vector<uint32_t> numbers = ListNumbers(folder).value();
  std::filesystem::remove_all(folder);
  EXPECT_EQ(numbers.size(), 8192U);
  EXPECT_EQ(std::set<uint32_t>(numbers.begin(), numbers.end()).size(), 8192U);
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

constexpr const char* wrapper = "/usr/lib/x86_64-linux-gnu/libnss_wrapper.so";

// The section of the report about them, without the rules of its tables.
std::string ReportOver(const std::string& passwd, const std::string& group) {
  const ScratchFolder scratch;
  scratch.Make("passwd", passwd);
  scratch.Make("group", group);
  // The sanitizer would demand to be the first library that is loaded.
  const std::string command =
      "ASAN_OPTIONS=verify_asan_link_order=0 LD_PRELOAD=" + std::string(wrapper) +
      " NSS_WRAPPER_PASSWD=" + scratch.In("passwd") + " NSS_WRAPPER_GROUP=" + scratch.In("group") +
      " ORX_COMMON_APPDATA=" + scratch.Root + " " ORX_PROGRAM " -start 1";
  EXPECT_EQ(std::system(command.c_str()), 0);
  const std::string text = FileText(scratch.In("ZEK/ORXHistory/1/ORXInstallEvent.Log"));
  const size_t begin = text.find("Logged on User:");
  const std::string section = text.substr(begin, text.find("2) Software") - begin);
  return std::regex_replace(section, std::regex("[-=]{35,}\n"), "");
}

TEST(Accounts, AreListedOnceWithAtMost127Bytes) {
  if (!std::filesystem::exists(wrapper)) {
    GTEST_SKIP() << "needs the package libnss-wrapper";
  }
  char name[HOST_NAME_MAX + 1] = "";
  ::gethostname(name, sizeof name);
  const std::string host = std::string(name).substr(0, std::string(name).find('.')) + '\\';
  const std::string fits(127 - host.size(), 'f');
  const std::string group127(127, 'g');
  const auto row = [&host](const std::string& group, const std::string& user) {
    const size_t blanks = group.size() < 30 ? 40 - group.size() : 10;
    return group + std::string(blanks, ' ') + host + user + '\n';
  };
  const std::string shell = "::/:/bin/sh\n";
  const std::string users = "me:x:" + std::to_string(::geteuid()) + ":0" + shell +
                            "ana:x:70005:100" + shell + "carl:x:70006:100" + shell + fits +
                            ":x:70007:300" + shell + fits + "f:x:70008:300" + shell;
  const std::string groups = "staff:x:100:bo,ana,bo\nempty:x:50:\nsame:x:100:\n" + group127 +
                             ":x:300:\n" + group127 + "g:x:301:bo\nstaff:x:302:zoe,bo\n";
  EXPECT_EQ(ReportOver(users, groups),
            "Logged on User:" + host +
                "me\n\nLocal Group List:\nGroup Name \nstaff\nempty\nsame\n" + group127 +
                "\n\n\nLocal User List:\n" + "Group                                   user   \n" +
                row("staff", "bo") + row("staff", "ana") + row("staff", "carl") +
                row("staff", "zoe") + row("same", "ana") + row("same", "carl") +
                row(group127, fits) + group127 + std::string(10, ' ') + "\n\n\n");
}

}  // namespace
