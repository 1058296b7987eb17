#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "inventory/info.h"

// One member of one group. A name that is too long for the system's buffer is empty.
struct CGroupMember {
  std::string Member;  // "DOMAIN\name" in a local group, "name" in a global one
  std::string Group;   // as in LocalGroups or GlobalGroups
};

// The user that runs the tool, and the machine's groups with their members, in the system's order.
// Global groups are collected on every machine and printed on a domain controller only.
class CUsersList : public Info {
 public:
  CUsersList();

  int32_t Collect() override;
  int32_t Print() override;

  // Empties the four lists. LoggedOnUser stays.
  void Clear();

  // The steps of Collect. One that fails leaves its list empty. The members are those of the groups
  // that an earlier step has listed.
  void CollectLoggedOnUser();
  void CollectLocalGroups();
  void CollectLocalMembers();
  void CollectGlobalGroups();
  void CollectGlobalMembers();

  // The server that is queried: two backslashes and the computer name. Empty, which also means this
  // machine, if the name is not known.
  std::string ServerName;

  std::string LoggedOnUser;  // "DOMAIN\name"; "name" if the domain is not known; or empty
  std::vector<std::string> LocalGroups;
  std::vector<CGroupMember> LocalMembers;
  std::vector<std::string> GlobalGroups;
  std::vector<CGroupMember> GlobalMembers;
};
