#pragma once

#include <chrono>
#include <string>

#include "platform/posix/descriptor.h"

enum class LockResult {
  kLocked,
  kNotLocked,  // another process kept the lock, or the file system has no locks
  kNoFolder,
};

// An exclusive flock on a folder, for as long as the object lives.
class FolderLock {
 public:
  // Waits for another process for at most timeLeft, and subtracts the time that it waited.
  FolderLock(const std::string& folder, std::chrono::nanoseconds& timeLeft);

  LockResult Result() const { return State; }

 private:
  Descriptor Folder;
  LockResult State = LockResult::kNotLocked;
};
