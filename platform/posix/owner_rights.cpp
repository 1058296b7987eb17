#include "platform/posix/owner_rights.h"

#include <grp.h>
#include <pwd.h>
#include <sys/fsuid.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstring>
#include <map>

#include "platform/posix/child_output.h"
#include "platform/posix/file_calls.h"

// Runs in a child process.
static void WriteGroups(uid_t user, const Descriptor& output) {
  const passwd* entry = RetryOnInterrupt([user] { return ::getpwuid(user); });
  if (entry == nullptr) {
    return;
  }
  gid_t groups[1024] = {};
  int count = 1024;
  if (::getgrouplist(entry->pw_name, entry->pw_gid, groups, &count) >= 0) {
    const size_t size = sizeof *groups * static_cast<size_t>(count);
    RetryOnInterrupt([&] { return ::write(output.Get(), groups, size); });
  }
}

// The primary group first. Each user is looked up once in a run.
static const std::vector<gid_t>& GroupsOf(uid_t user) {
  static std::map<uid_t, std::vector<gid_t>> known;
  const auto [entry, isNew] = known.try_emplace(user);
  if (isNew) {
    const std::string bytes = ChildOutput(
        [user](const Descriptor& output) { WriteGroups(user, output); }, std::chrono::seconds(10));
    entry->second.resize(bytes.size() / sizeof(gid_t));
    std::memcpy(entry->second.data(), bytes.data(), entry->second.size() * sizeof(gid_t));
  }
  return entry->second;
}

static std::vector<gid_t> GroupsOfThisProcess() {
  std::vector<gid_t> groups(static_cast<size_t>(std::max(::getgroups(0, nullptr), 0)));
  const int count = ::getgroups(static_cast<int>(groups.size()), groups.data());
  groups.resize(static_cast<size_t>(std::max(count, 0)));
  return groups;
}

OwnerRights::OwnerRights(const std::string& path) {
  struct stat status = {};
  if (::geteuid() != 0 || !StatusOf(path, Links::kFollow, status) || status.st_uid == 0) {
    return;
  }
  constexpr gid_t nogroup = 65534;
  const std::vector<gid_t>& groups = GroupsOf(status.st_uid);
  OwnGroups = GroupsOfThisProcess();
  IsTaken = true;
  ::setgroups(groups.size(), groups.data());
  ::setfsgid(groups.empty() ? nogroup : groups.front());
  ::setfsuid(status.st_uid);
}

OwnerRights::~OwnerRights() {
  if (IsTaken) {
    ::setfsuid(::geteuid());
    ::setfsgid(::getegid());
    ::setgroups(OwnGroups.size(), OwnGroups.data());
  }
}
