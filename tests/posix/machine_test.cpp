// What the program reads of a machine, with the values of other machines.

#include <gtest/gtest.h>
#include <unistd.h>

#include <climits>
#include <cstdlib>
#include <filesystem>
#include <set>

#include "platform/posix/host_name.h"
#include "platform/posix/process_folder.h"
#include "tests/support/scratch_folder.h"

namespace {

TEST(Machine, HasAShortNameOfAtMost14Characters) {
  for (const auto& [hostName, name] :
       {std::pair("fourteen-bytes", "fourteen-bytes"), std::pair("fifteen-bytes--", "none"),
        std::pair("fourteen-bytes.domain", "fourteen-bytes"), std::pair(".domain", "none")}) {
    EXPECT_EQ(ShortNameOf(FirstLabel(hostName)).value_or("none"), name);
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

// The section of the report about the accounts of these files.
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
  return text.substr(begin, text.find("2) Software") - begin);
}

// A file of accounts/, completed with what depends on the machine and with the longest names.
std::string AccountText(const std::string& file) {
  char name[HOST_NAME_MAX + 1] = "";
  ::gethostname(name, sizeof name);
  const std::string domain = FirstLabel(name) + '\\';
  std::string text = FileText(ORX_POSIX_TESTS "/accounts/" + file);
  for (const auto& [mark, by] :
       {std::pair("<domain>", domain), std::pair("<own ID>", std::to_string(::geteuid())),
        std::pair("<fits>", std::string(127 - domain.size(), 'f')),
        std::pair("<127 bytes>", std::string(127, 'g'))}) {
    text = Replaced(text, mark, by);
  }
  return text;
}

TEST(Accounts, AreListedOnceWithAtMost127Bytes) {
  if (!std::filesystem::exists(wrapper)) {
    GTEST_SKIP() << "needs the package libnss-wrapper";
  }
  EXPECT_EQ(ReportOver(AccountText("passwd"), AccountText("group")), AccountText("section.txt"));
}

}  // namespace
