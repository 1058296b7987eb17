#pragma once

#include <chrono>
#include <map>
#include <string>

#include "platform/windows/folder_lock.h"
#include "platform/windows/system.h"

// The locks that this process holds, and the copies of profile files that are changed under them.
//
// The system's calls change a profile file in place and lose keys when two processes do so at once.
// So every access, a read too, is made inside Enter and Leave; and the writes go to a copy in the
// same folder, which replaces the file in the last Leave. A copy that a killed process left is
// removed by the next change. The calls also do not say whether a read failed, so that it is
// checked before each one that the file can be read.
class ProfileStore {
 public:
  // One per process: the profile calls have only a path, and they share the locks.
  static ProfileStore& GetInstance();

  // The file to read. While Opened exists, no other program can open it without sharing.
  struct Readable {
    std::string Path;  // empty if the file cannot be read; a file that does not exist can
    UniqueHandle Opened;
  };
  // After a failure the file cannot be read or changed until the last Leave: what was read before
  // may be wrong and must not be written back.
  Readable OpenForReading(const std::string& path);

  bool Write(const std::string& path, const std::string& section, const std::string& key,
             const std::string& value);

  // Locks the folder of the file until the last Leave. Calls nest, with the same path or others.
  // Without the lock, runs go on: one may undo a change of another, but none leaves half a file.
  void Enter(const std::string& path);

  // The last one replaces every file that was changed and frees the locks. False if a file could
  // not be replaced: it is as it was.
  bool Leave();

  // Time that the process may still wait for locks, all together.
  std::chrono::nanoseconds LockTime = std::chrono::seconds(10);

 private:
  enum class State { kUnchanged, kChanged, kFailed };

  struct File {
    std::string Copy;
    State Changes = State::kUnchanged;
  };

  bool MakeCopy(const std::string& path, File& file) const;

  std::map<std::string, File> Files;
  std::map<std::string, FolderLock> Locks;
  int Depth = 0;
};
