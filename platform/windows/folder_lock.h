#pragma once

#include <chrono>
#include <string>

#include "platform/windows/system.h"

// A mutex named after a folder, owned for as long as the object lives. It is one for the whole
// machine: processes of any session and user share it.
class FolderLock {
 public:
  // Waits for another process at most as long as timeLeft says, and subtracts what it waited.
  FolderLock(const std::string& folder, std::chrono::nanoseconds& timeLeft);
  ~FolderLock();
  FolderLock(const FolderLock&) = delete;
  FolderLock& operator=(const FolderLock&) = delete;

  // False if somebody else kept the mutex, or the system refuses it.
  bool IsLocked() const { return IsOwner; }

 private:
  UniqueHandle Mutex;
  bool IsOwner = false;
};

// The mutex of a folder, as everybody may open it; for tests too.
UniqueHandle OpenFolderMutex(const std::string& folder);
