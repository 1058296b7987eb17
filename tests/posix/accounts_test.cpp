// Users and groups: this machine's, as getent tells them, and made-up ones.

#include "platform/accounts.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <sstream>

namespace {

using Texts = std::vector<std::string>;

std::string OutputOf(const std::string& command) {
  std::string output;
  FILE* pipe = ::popen(command.c_str(), "r");
  for (int c = std::fgetc(pipe); c != EOF; c = std::fgetc(pipe)) {
    output += static_cast<char>(c);
  }
  ::pclose(pipe);
  return output;
}

Texts Split(const std::string& text, char separator) {
  Texts parts;
  std::istringstream stream(text);
  for (std::string part; std::getline(stream, part, separator);) {
    parts.push_back(part);
  }
  return parts;
}

std::string Host() { return Split(Split(OutputOf("uname -n"), '\n').at(0), '.').at(0); }

TEST(Accounts, AreThoseOfTheNameService) {
  std::map<std::string, Texts> usersByGroup;
  for (const std::string& line : Split(OutputOf("getent passwd"), '\n')) {
    const Texts fields = Split(line, ':');
    usersByGroup[fields.at(3)].push_back(Host() + '\\' + fields.at(0));
  }
  Texts names;
  for (const std::string& line : Split(OutputOf("getent group"), '\n')) {
    const Texts fields = Split(line, ':');
    names.push_back(fields.at(0));
    Texts members;
    for (const std::string& member : Split(fields.size() > 3 ? fields[3] : "", ',')) {
      members.push_back(Host() + '\\' + member);
    }
    for (const std::string& user : usersByGroup[fields.at(2)]) {
      if (std::find(members.begin(), members.end(), user) == members.end()) {
        members.push_back(user);
      }
    }
    EXPECT_EQ(ListLocalGroupMembers("", fields[0]), members) << line;
  }
  EXPECT_FALSE(names.empty());
  EXPECT_EQ(ListLocalGroups("\\\\" + Host()), names);
  EXPECT_TRUE(ListLocalGroupMembers("", "no such group").empty());
  EXPECT_EQ(DomainUserName(), Host() + '\\' + Split(OutputOf("id -un"), '\n').at(0));
  EXPECT_TRUE(ListGlobalGroups("").empty());
}

constexpr const char* wrapper = "/usr/lib/x86_64-linux-gnu/libnss_wrapper.so";

// The report of a program that sees the given users and groups in place of the machine's.
std::string ReportOver(const std::string& passwd, const std::string& group) {
  char folder[] = "/tmp/orx-accounts-XXXXXX";
  EXPECT_NE(::mkdtemp(folder), nullptr);
  const std::string root = folder;
  std::ofstream(root + "/passwd") << passwd;
  std::ofstream(root + "/group") << group;
  // The sanitizer's library wants to be the first that is loaded.
  OutputOf("ASAN_OPTIONS=verify_asan_link_order=0 LD_PRELOAD=" + std::string(wrapper) +
           " NSS_WRAPPER_PASSWD=" + root + "/passwd NSS_WRAPPER_GROUP=" + root +
           "/group ORX_COMMON_APPDATA=" + root + " " ORX_PROGRAM " -start 1");
  std::ifstream report(root + "/ZEK/ORXHistory/1/ORXInstallEvent.Log");
  std::string text(std::istreambuf_iterator<char>(report), {});
  std::filesystem::remove_all(root);
  return text;
}

std::string Between(const std::string& text, const std::string& begin, const std::string& end) {
  const size_t from = text.find(begin) + begin.size();
  return text.substr(from, text.find(end, from) - from);
}

TEST(Accounts, CountOnceAndFitTheirBuffer) {
  if (!std::filesystem::exists(wrapper)) {
    GTEST_SKIP() << "needs the package libnss-wrapper";
  }
  const std::string host = Host() + '\\';
  const std::string fits(127 - host.size(), 'f');
  const std::string group127(127, 'g');
  std::string manyMembers;
  std::string manyRows;
  for (int i = 0; i < 5000; ++i) {
    const std::string name = "m" + std::to_string(i);
    manyMembers += name + ',';
    manyRows += "many" + std::string(36, ' ') + host + name + '\n';
  }
  manyMembers.pop_back();
  const std::string report =
      ReportOver("root:x:0:0::/:/bin/sh\nana:x:5:100::/:/bin/sh\ncarl:x:6:100::/:/bin/sh\n" + fits +
                     ":x:7:300::/:/bin/sh\n" + fits + "f:x:8:300::/:/bin/sh\n",
                 "staff:x:100:bo,ana,bo\nempty:x:50:\nsame:x:100:\nmany:x:200:" + manyMembers +
                     "\n" + group127 + ":x:300:\n" + group127 + "g:x:301:bo\n");
  const std::string rule(35, '-');
  EXPECT_EQ(Between(report, "Group Name \n" + rule + '\n', rule),
            "staff\nempty\nsame\nmany\n" + group127 + "\n\n");
  const std::string wideRule = std::string(74, '-') + '\n';
  const std::string blanks(10, ' ');
  EXPECT_EQ(Between(report, "user   \n" + wideRule, wideRule),
            "staff                                   " + host + "bo\n" +
                "staff                                   " + host + "ana\n" +
                "staff                                   " + host + "carl\n" +
                "same                                    " + host + "ana\n" +
                "same                                    " + host + "carl\n" + manyRows + group127 +
                blanks + host + fits + '\n' + group127 + blanks + '\n');
}

}  // namespace
