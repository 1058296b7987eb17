#include "platform/accounts.h"

#include <grp.h>
#include <pwd.h>
#include <unistd.h>

#include <string_view>
#include <unordered_map>
#include <unordered_set>

#include "platform/posix/child_output.h"
#include "platform/posix/descriptor.h"
#include "platform/posix/host_name.h"
#include "platform/posix/text_file.h"

namespace {

using NamesByGroup = std::unordered_map<std::string, std::vector<std::string>>;

struct NameServiceAnswers {
  std::optional<std::string> OwnUser;
  std::vector<std::string> Groups;  // each name once
  NamesByGroup Members;
};

// The child writes what the name service returns as records, each a letter and a text, ended by a
// zero byte: u the user that runs the tool; g a group, and after it m for each member; e the end.
void AppendRecord(std::string& records, char kind, std::string_view text) {
  records += kind;
  records += text;
  records += '\0';
}

using UsersByNumber = std::unordered_map<gid_t, std::vector<std::string>>;

UsersByNumber ReadUsersByPrimaryGroup() {
  UsersByNumber users;
  ::setpwent();
  while (const passwd* user = RetryOnInterrupt(::getpwent)) {
    users[user->pw_gid].emplace_back(user->pw_name);
  }
  ::endpwent();
  return users;
}

// Reads each database once for all groups: reading it for each group would take time proportional
// to groups times groups, and users times groups.
void AskNameService(const Descriptor& output) {
  std::string records;
  if (const passwd* user = RetryOnInterrupt([] { return ::getpwuid(::geteuid()); })) {
    AppendRecord(records, 'u', user->pw_name);
  }
  WriteAll(output, records);
  records.clear();
  const UsersByNumber users = ReadUsersByPrimaryGroup();
  ::setgrent();
  while (const group* entry = RetryOnInterrupt(::getgrent)) {
    AppendRecord(records, 'g', entry->gr_name);
    for (char** member = entry->gr_mem; *member != nullptr; ++member) {
      AppendRecord(records, 'm', *member);
    }
    if (const auto found = users.find(entry->gr_gid); found != users.end()) {
      for (const std::string& user : found->second) {
        AppendRecord(records, 'm', user);
      }
    }
  }
  ::endgrent();
  AppendRecord(records, 'e', "");
  WriteAll(output, records);
}

// Adds the group if it is new; systems may list one more than once.
std::vector<std::string>& MembersOf(const std::string& group, NameServiceAnswers& answers) {
  const auto [entry, isNew] = answers.Members.try_emplace(group);
  if (isNew) {
    answers.Groups.push_back(group);
  }
  return entry->second;
}

// Without the end record some groups or members are missing: then it returns no groups at all.
NameServiceAnswers ParseRecords(std::string_view records) {
  NameServiceAnswers answers;
  bool isComplete = false;
  std::vector<std::string>* members = nullptr;
  while (!records.empty()) {
    const std::string_view record = records.substr(0, records.find('\0'));
    records.remove_prefix(std::min(record.size() + 1, records.size()));
    const std::string text(record.substr(1));
    switch (record.front()) {
      case 'u':
        answers.OwnUser = text;
        break;
      case 'g':
        members = &MembersOf(text, answers);
        break;
      case 'm':
        if (members != nullptr) {
          members->push_back(text);
        }
        break;
      default:
        isComplete = true;
        break;
    }
  }
  return isComplete ? answers : NameServiceAnswers{answers.OwnUser, {}, {}};
}

// Kept for the whole run, so that it waits for the name service once.
const NameServiceAnswers& NameService() {
  static const NameServiceAnswers answers =
      ParseRecords(ChildOutput(&AskNameService, std::chrono::seconds(10)));
  return answers;
}

std::string FittingName(const std::string& name) {
  constexpr size_t longest = 127;
  return name.size() <= longest ? name : "";
}

}  // namespace

std::optional<std::string> DomainUserName() {
  const std::optional<std::string>& user = NameService().OwnUser;
  return user ? std::optional(HostName() + '\\' + *user) : std::nullopt;
}

std::optional<std::string> WorkstationUserName() {
  return FittingName(NameService().OwnUser.value_or(std::to_string(::geteuid())));
}

std::vector<std::string> ListLocalGroups(const std::string& /*server*/) {
  std::vector<std::string> names;
  for (const std::string& name : NameService().Groups) {
    names.push_back(FittingName(name));
  }
  return names;
}

std::vector<std::string> ListLocalGroupMembers(const std::string& /*server*/,
                                               const std::string& group) {
  const NamesByGroup& groups = NameService().Members;
  const auto found = groups.find(group);
  if (found == groups.end()) {
    return {};
  }
  const std::string domain = HostName() + '\\';
  std::unordered_set<std::string_view> seen;
  std::vector<std::string> members;
  for (const std::string& user : found->second) {
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
