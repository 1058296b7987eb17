// What the lists of a snapshot hold and the golden report does not show.

#include <gtest/gtest.h>

#include "history/locations.h"
#include "inventory/process_list.h"
#include "inventory/service_list.h"
#include "inventory/user_list.h"
#include "platform/path.h"
#include "products/copy_generation.h"
#include "products/products_list.h"
#include "products/registry_value.h"
#include "tests/support/fake_machine.h"
#include "tests/support/file_text.h"
#include "tests/support/run_tool.h"

namespace {

using namespace std::string_literals;

const int32_t firstGeneration = GetCopyGeneration();

TEST(Lists, ReadTextsAndNumbersAndNothingElse) {
  const std::vector<std::pair<RegistryData, std::string>> cases = {
      {{kRegistryText, "no zero"}, "no zero"},
      {{kRegistryText, "first\0second\0"s}, "first"},
      {{kRegistryText, std::string(99, 'x') + '\0'}, std::string(99, 'x')},
      {{kRegistryText, std::string(100, 'x') + '\0'}, ""},
      {{kRegistryText, "\0"s}, ""},
      {{kRegistryNumber, "\0\0\0\0"s}, "0"},
      {{kRegistryNumber, "\x09\x04\0\0"s}, "1033"},
      {{kRegistryNumber, "\xFF\xFF\xFF\xFF"}, "-1"},
      {{kRegistryNumber, "\0\0\0\x80"s}, "-2147483648"},
      {{kRegistryNumber, "\x01\x02"}, ""},
      {{kRegistryNumber, "\x01\0\0\0\0\0\0\0"s}, ""},
      {{2, "%PATH%\0"s}, ""},
      {{3, "\x01\x02\x03\x04"}, ""}};
  for (const auto& [data, text] : cases) {
    Machine() = FakeMachine();
    Machine().Registry = {{"SOFTWARE\\ZEK", "Value", data}};
    EXPECT_EQ(ReadRegistryValue("SOFTWARE\\ZEK", "Value"), text);
    EXPECT_EQ(ReadRegistryValue("SOFTWARE\\ZEK", "Missing"), "");
    // 0x2001B: to read, and to set values.
    EXPECT_EQ(Machine().RegistryQuestions.at(0), "SOFTWARE\\ZEK|Value|100|131099");
  }
}

// They can neither add a line nor reach a terminal. A letter of a code page stays.
TEST(Lists, ShowControlCharactersAsQuestionMarks) {
  const std::string name = "ORX\n1) \r\t\0\x1B[2J\x7F|\xC2\x85\xC2\x9F|\xC2\xA0\x80\x9F\xC3\x9F~"s;
  // Where these bytes begin two-byte characters, they are letters.
  const std::string controls = IsLeadByte('\x85') ? "\xC2\x85\xC2\x9F" : "??";
  const std::string shown = "ORX?1) ????[2J?|" + controls + "|\xC2\xA0\x80\x9F\xC3\x9F~";
  Machine() = FakeMachine();
  Machine().DomainUser = name;
  Machine().LocalGroups = {{name, {name}}};
  Machine().ProcessIDs = {{9}};
  Machine().Modules = {{9, {name}}};
  Machine().Services.Entries = {{name, name, 1}};
  const std::string text = LoggedText([] {
    CUsersList users;
    CProcessList processes;
    CServicesList services;
    for (Info* list : std::initializer_list<Info*>{&users, &processes, &services}) {
      list->Collect();
      list->Print();
    }
  });
  const auto padded = [&shown](size_t width) {
    return shown + std::string(width - shown.size(), ' ');
  };
  for (const std::string& line :
       {"Logged on User:" + shown, std::string(35, '-') + '\n' + shown, padded(40) + shown,
        '9' + std::string(18, ' ') + shown, padded(60) + "Stopped"}) {
    EXPECT_NE(text.find('\n' + line + '\n'), std::string::npos) << line << text;
  }
}

TEST(Lists, AreEmptyWhenNothingIsListed) {
  Machine() = FakeMachine();
  Machine().Services = {5, {}};
  CServicesList list;
  list.Services.resize(1);
  EXPECT_TRUE(list.Collect() == 5 && list.Services.empty());
  CUsersList users;
  users.LocalMembers.resize(1);
  users.GlobalMembers.resize(1);
  EXPECT_TRUE(users.Collect() == 0 && users.LocalMembers.empty() && users.GlobalMembers.empty());
}

TEST(Lists, TakeTheOldCopyInItsOwnCaseOnly) {
  Machine() = FakeMachine();
  Machine().Load("[SOFTWARE\\ZEK\\orx]\n");
  SetCopyGeneration(0);
  const std::string text = LoggedText([] {
    CORXProductsList list;
    list.Collect();
    list.Print();
  });
  EXPECT_TRUE(text.ends_with("*\nThere is no ORX prior to V9 Installed \n")) << text;
}

TEST(Lists, AppendTheCopiesOfTheLayoutInForce) {
  EXPECT_EQ(firstGeneration, 1);
  Machine() = FakeMachine();
  Machine().Load(Golden("registry_added.txt"));
  CORXProductsList list;
  for (const int32_t generation : {0, 1, 1}) {
    SetCopyGeneration(generation);
    EXPECT_EQ(list.Collect(), 0);
  }
  std::string names;
  for (const CORXCopy& copy : list.Copies) {
    names += std::to_string(copy.Generation) + ' ' + copy.Name + '\n';
  }
  // The first is the parent of the later layout's copies.
  EXPECT_EQ(names, "0 ORX\n1 Empty\n1 C1\n1 Empty\n1 C1\n");

  // What is no part of the report.
  const CORXCopy& copy = list.Copies.at(2);
  const auto& [version, release, modification, serviceLevel] = copy.VersionInfo;
  EXPECT_EQ(version + release + modification + serviceLevel, "940Level 0");
  const CORXProduct& product = copy.Products.at(0);
  EXPECT_EQ(product.CopyName + '|' + product.Title + '|' + product.Description,
            "C1|not shown|nor this");
  const CADMInstance& instance = copy.AdmInstances.at(0);
  EXPECT_EQ(instance.CopyName + instance.Name + instance.Parameters.at(0).Value, "C1ADM1shown");
}

}  // namespace
