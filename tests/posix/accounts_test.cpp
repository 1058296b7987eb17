// The program's report with supplied users and groups.

#include <gtest/gtest.h>
#include <unistd.h>

#include <climits>
#include <cstdlib>
#include <filesystem>
#include <regex>

#include "tests/support/scratch_folder.h"

namespace {

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
  std::string manyMembers = "bo";
  std::string manyRows = row("many", "bo");
  for (int i = 0; i < 1000; ++i) {
    manyMembers += ",m" + std::to_string(i);
    manyRows += row("many", 'm' + std::to_string(i));
  }
  const std::string shell = "::/:/bin/sh\n";
  const std::string report =
      ReportOver("me:x:" + std::to_string(::geteuid()) + ":0" + shell + "ana:x:70005:100" + shell +
                     "carl:x:70006:100" + shell + fits + ":x:70007:300" + shell + fits +
                     "f:x:70008:300" + shell,
                 "staff:x:100:bo,ana,bo\nempty:x:50:\nsame:x:100:\nmany:x:200:" + manyMembers +
                     '\n' + group127 + ":x:300:\n" + group127 + "g:x:301:bo\nstaff:x:302:zoe,bo\n");
  EXPECT_EQ(report, "Logged on User:" + host + "me\n\nLocal Group List:\nGroup Name \nstaff\n" +
                        "empty\nsame\nmany\n" + group127 + "\n\n\nLocal User List:\n" +
                        "Group                                   user   \n" + row("staff", "bo") +
                        row("staff", "ana") + row("staff", "carl") + row("staff", "zoe") +
                        row("same", "ana") + row("same", "carl") + manyRows + row(group127, fits) +
                        group127 + std::string(10, ' ') + "\n\n\n");
}

}  // namespace
