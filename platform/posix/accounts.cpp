#include "platform/accounts.h"

#include <grp.h>
#include <pwd.h>
#include <unistd.h>

#include <string_view>
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

struct Group {
  gid_t Number = 0;
  std::vector<std::string> Members;
};

using GroupsByName = std::unordered_map<std::string, Group>;

// Of two groups with one name the first, as getgrnam has it.
GroupsByName ReadGroups() {
  GroupsByName groups;
  ::setgrent();
  while (const ::group* entry = ::getgrent()) {
    const auto [place, isNew] = groups.try_emplace(entry->gr_name, Group{entry->gr_gid, {}});
    for (char** member = entry->gr_mem; isNew && *member != nullptr; ++member) {
      place->second.Members.emplace_back(*member);
    }
  }
  ::endgrent();
  return groups;
}

// The named members of a group, and behind them the users whose primary group it is. One walk
// through each database serves all groups of a run: a walk for each would cost groups times groups,
// and users times groups.
std::vector<std::string> UsersOf(const std::string& group) {
  static const GroupsByName groups = ReadGroups();
  static const UsersByGroup primaryUsers = ReadUsersByPrimaryGroup();
  const auto place = groups.find(group);
  if (place == groups.end()) {
    return {};
  }
  std::vector<std::string> users = place->second.Members;
  if (const auto more = primaryUsers.find(place->second.Number); more != primaryUsers.end()) {
    users.insert(users.end(), more->second.begin(), more->second.end());
  }
  return users;
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
  const std::vector<std::string> users = UsersOf(group);
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
