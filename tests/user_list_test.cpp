#include "inventory/user_list.h"

#include <gtest/gtest.h>

#include "tests/fake_machine.h"

namespace {

TEST(UserList, NamesTheUserByTheBestAnswer) {
  struct {
    std::optional<std::string> DomainUser;
    std::optional<std::string> WorkstationUser;
    const char* LoggedOnUser;
  } const cases[] = {
      {"HOST\\ana", "ana", "HOST\\ana"},
      {std::nullopt, "ana", "ana"},
      {std::nullopt, std::nullopt, ""},
  };
  for (const auto& test : cases) {
    Machine() = FakeMachine();
    Machine().DomainUser = test.DomainUser;
    Machine().WorkstationUser = test.WorkstationUser;
    CUsersList list;
    EXPECT_EQ(list.Collect(), 0);
    EXPECT_EQ(list.LoggedOnUser, test.LoggedOnUser);
  }
}

TEST(UserList, AsksNoServerButTheMachineItself) {
  Machine() = FakeMachine();
  Machine().LocalGroups = {{"Users", {"HOST\\ana"}}};
  Machine().GlobalGroups = {{"Domain Users", {"ana", "bo"}}};
  Machine().ComputerName = "HOST";
  CUsersList named;
  Machine().ComputerName.reset();  // a name that is too long
  CUsersList unnamed;

  named.Collect();
  EXPECT_EQ(Machine().ServersAsked, std::vector<std::string>(4, "\\\\HOST"));
  Machine().ServersAsked.clear();
  unnamed.Collect();
  EXPECT_EQ(Machine().ServersAsked, std::vector<std::string>(4, ""));
  ASSERT_EQ(unnamed.GlobalMembers.size(), 2U);
  EXPECT_EQ(unnamed.GlobalMembers[1].Member, "bo");
  EXPECT_EQ(unnamed.GlobalMembers[1].Group, "Domain Users");

  Machine().LocalGroups.clear();
  unnamed.Collect();
  EXPECT_TRUE(unnamed.LocalGroups.empty());
  EXPECT_TRUE(unnamed.LocalMembers.empty());
  EXPECT_EQ(unnamed.GlobalMembers.size(), 2U);
}

}  // namespace
