#pragma once

#include <chrono>
#include <string>

#include "platform/windows/system.h"

// A mutex named after a folder, owned for as long as the object lives. Processes of every session
// and user share it (CreateMutexExA, WaitForSingleObject).
class FolderLock {
 public:
  // Waits for another process for at most timeLeft, and subtracts the time that it waited.
  FolderLock(const std::string& folder, std::chrono::nanoseconds& timeLeft);
  ~FolderLock();
  FolderLock(const FolderLock&) = delete;
  FolderLock& operator=(const FolderLock&) = delete;

  // False if another process kept the mutex, or the system refuses it.
  bool IsLocked() const { return IsOwner; }

 private:
  UniqueHandle Mutex;
  bool IsOwner = false;
};

// The mutex of a folder, not yet owned; empty if the system refuses it. Tests hold it too.
UniqueHandle OpenFolderMutex(const std::string& folder);
