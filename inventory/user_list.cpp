#include "inventory/user_list.h"

#include <iomanip>

#include "eventlog/logger.h"
#include "inventory/computer_info.h"
#include "inventory/shown_name.h"
#include "platform/accounts.h"
#include "platform/computer.h"

CUsersList::CUsersList() {
  if (const std::optional<std::string> name = ShortComputerName()) {
    ServerName = "\\\\" + *name;
  }
}

int32_t CUsersList::Collect() {
  Clear();
  CollectLoggedOnUser();
  CollectLocalGroups();
  CollectLocalMembers();
  CollectGlobalGroups();
  CollectGlobalMembers();
  return 0;
}

void CUsersList::Clear() {
  LocalGroups.clear();
  LocalMembers.clear();
  GlobalGroups.clear();
  GlobalMembers.clear();
}

void CUsersList::CollectLoggedOnUser() {
  if (const std::optional<std::string> user = DomainUserName()) {
    LoggedOnUser = *user;
  } else if (const std::optional<std::string> bareName = WorkstationUserName()) {
    LoggedOnUser = *bareName;
  }
}

void CUsersList::CollectLocalGroups() { LocalGroups = ListLocalGroups(ServerName); }

void CUsersList::CollectLocalMembers() {
  for (const std::string& group : LocalGroups) {
    for (const std::string& member : ListLocalGroupMembers(ServerName, group)) {
      LocalMembers.push_back({member, group});
    }
  }
}

void CUsersList::CollectGlobalGroups() { GlobalGroups = ListGlobalGroups(ServerName); }

void CUsersList::CollectGlobalMembers() {
  for (const std::string& group : GlobalGroups) {
    for (const std::string& member : ListGlobalGroupMembers(ServerName, group)) {
      GlobalMembers.push_back({member, group});
    }
  }
}

// The caller writes the last rule, as its length differs.
static void PrintGroups(const char* title, const std::vector<std::string>& groups) {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(35, '-');
  log << title << std::endl;
  log << rule << std::endl;
  log << "Group Name " << std::endl;
  log << rule << std::endl;
  for (const std::string& group : groups) {
    log << ShownName(group) << std::endl;
  }
}

static void PrintMembers(const char* title, const std::vector<CGroupMember>& members) {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(74, '-');
  log << title << std::endl;
  log << rule << std::endl;
  log << "Group                                   user   " << std::endl;
  log << rule << std::endl;
  for (const CGroupMember& member : members) {
    log << std::left << std::setw(30) << ShownName(member.Group) << "          "
        << ShownName(member.Member) << std::endl;
  }
  log << rule << std::endl;
}

int32_t CUsersList::Print() {
  CLogger& log = CLogger::GetInstance();
  const std::string frame(83, '=');
  log << std::endl;
  log << "Logged on User:" << ShownName(LoggedOnUser) << std::endl;
  log << frame << std::endl;
  log << std::endl;
  PrintGroups("Local Group List:", LocalGroups);
  log << std::string(35, '-') << std::endl;
  log << std::endl;
  PrintMembers("Local User List:", LocalMembers);
  log << std::endl;
  CComputerInfo computer;
  computer.Collect();
  if (computer.IsDomainController) {
    PrintGroups("Global Group List:", GlobalGroups);
    log << std::string(74, '-') << std::endl;
    PrintMembers("Global User List:", GlobalMembers);
  }
  log << frame << std::endl;
  return 0;
}
