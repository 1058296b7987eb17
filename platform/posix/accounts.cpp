#include "platform/accounts.h"

#include <grp.h>
#include <pwd.h>
#include <unistd.h>

#include <unordered_map>
#include <unordered_set>

#include "platform/posix/host_name.h"

namespace {

std::string FittingName(const std::string& name) {
  constexpr size_t longest = 127;
  return name.size() <= longest ? name : "";
}

using UsersByGroup = std::unordered_map<gid_t, std::vector<std::string>>;

UsersByGroup ReadUsersByPrimaryGroup() {
  UsersByGroup users;
  ::setpwent();
  while (const passwd* user = ::getpwent()) {
    users[user->pw_gid].emplace_back(user->pw_name);
  }
  ::endpwent();
  return users;
}

// The users whose primary group it is. One walk through the user database serves all groups of a
// run: a walk for each would cost users times groups.
const std::vector<std::string>& PrimaryUsersOf(gid_t group) {
  static UsersByGroup users = ReadUsersByPrimaryGroup();
  return users[group];
}

}  // namespace

std::optional<std::string> DomainUserName() {
  const passwd* user = ::getpwuid(::geteuid());
  return user == nullptr ? std::nullopt : std::optional(HostName() + '\\' + user->pw_name);
}

std::optional<std::string> WorkstationUserName() {
  const passwd* user = ::getpwuid(::geteuid());
  return user == nullptr ? std::to_string(::geteuid()) : FittingName(user->pw_name);
}

std::vector<std::string> ListLocalGroups(const std::string& /*server*/) {
  std::vector<std::string> names;
  ::setgrent();
  while (const group* entry = ::getgrent()) {
    names.push_back(FittingName(entry->gr_name));
  }
  ::endgrent();
  return names;
}

std::vector<std::string> ListLocalGroupMembers(const std::string& /*server*/,
                                               const std::string& group) {
  const ::group* entry = ::getgrnam(group.c_str());
  if (entry == nullptr) {
    return {};
  }
  std::vector<std::string> users;
  for (char** member = entry->gr_mem; *member != nullptr; ++member) {
    users.emplace_back(*member);
  }
  const std::vector<std::string>& primaryUsers = PrimaryUsersOf(entry->gr_gid);
  users.insert(users.end(), primaryUsers.begin(), primaryUsers.end());

  const std::string domain = HostName() + '\\';
  std::unordered_set<std::string_view> seen;
  std::vector<std::string> members;
  for (const std::string& user : users) {
    if (seen.insert(user).second) {
      members.push_back(FittingName(domain + user));
    }
  }
  return members;
}

std::vector<std::string> ListGlobalGroups(const std::string& /*server*/) { return {}; }

std::vector<std::string> ListGlobalGroupMembers(const std::string& /*server*/,
                                                const std::string& /*group*/) {
  return {};
}
