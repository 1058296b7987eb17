#pragma once

#include <sys/types.h>

#include <string>
#include <vector>

// While the object exists, this process opens files with the rights of the owner of the file at the
// path (setfsuid, setfsgid, setgroups), if it is root's process and another user's file; otherwise
// nothing changes. The owner's groups count if the name service lists them within ten seconds.
class OwnerRights {
 public:
  explicit OwnerRights(const std::string& path);
  ~OwnerRights();
  OwnerRights(const OwnerRights&) = delete;
  OwnerRights& operator=(const OwnerRights&) = delete;

 private:
  bool IsTaken = false;
  std::vector<gid_t> OwnGroups;
};
