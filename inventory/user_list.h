#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "inventory/info.h"

struct CGroupMember {
  std::string Member;  // with its domain in a local group, without in a global one
  std::string Group;
};

// The user that runs the tool and the machine's groups with their members, all in the system's
// order. Global groups are asked for on every machine, and printed on a domain controller only.
class CUsersList : public Info {
 public:
  CUsersList();

  int32_t Collect() override;
  int32_t Print() override;

  // Empties the four lists.
  void Clear();

  // The steps of Collect. One that fails leaves its list empty; members come from the groups that
  // were listed before.
  void CollectLoggedOnUser();
  void CollectLocalGroups();
  void CollectLocalMembers();
  void CollectGlobalGroups();
  void CollectGlobalMembers();

  // Two backslashes and the computer name: the one server that is ever asked. Empty, which means
  // this machine too, if the name cannot be told.
  std::string ServerName;
  std::string LoggedOnUser;
  std::vector<std::string> LocalGroups;
  std::vector<CGroupMember> LocalMembers;
  std::vector<std::string> GlobalGroups;
  std::vector<CGroupMember> GlobalMembers;
};
