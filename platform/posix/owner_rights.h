#pragma once

#include <sys/types.h>

#include <string>
#include <vector>

// While it exists, files are opened with the rights of another file's owner, if this process is
// root's and the owner is another user; else nothing changes. A group counts if the name service
// lists it for the owner within ten seconds.
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
