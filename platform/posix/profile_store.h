#pragma once

#include <sys/stat.h>

#include <chrono>
#include <map>
#include <memory>
#include <string>

#include "platform/posix/descriptor.h"
#include "platform/posix/folder_lock.h"
#include "platform/profile_text.h"

// The profile files that this process uses, parsed, and the locks on their folders.
//
// Other processes replace a file and do not change it in place. So a text that was read once is
// valid as long as the path leads to the same device, inode, size and change time; every access
// checks that. The file stays open as long as its text is kept, so that its inode number is not
// used again for another file.
class ProfileStore {
 public:
  // One per process: the profile calls have only a path, and they share the locks.
  static ProfileStore& GetInstance();

  // The text as it is now, valid until the next call: empty if there is no file, null if it cannot
  // be read. After such a failure between Enter and Leave, the file cannot be read or changed until
  // Leave: what was read before may be wrong and must not be written back.
  const ProfileText* Load(const std::string& path);

  // Changes a key of the text that Load returns; to be called between Enter and Leave.
  bool Set(const std::string& path, const std::string& section, const std::string& key,
           const std::string& value);

  // Locks the folder of the file until the last Leave. Calls nest, with the same path or others.
  // Without the lock, runs go on: one may undo a change of another, but none leaves half a file.
  void Enter(const std::string& path);

  // The last one writes every file that was changed and frees the locks. False if a file could not
  // be written: it is as it was, and so is the next Load.
  bool Leave();

  // Time that the process may still wait for locks, all together.
  std::chrono::nanoseconds LockTime = std::chrono::seconds(10);

 private:
  enum class State { kUnchanged, kChanged, kFailed };

  struct File {
    std::unique_ptr<ProfileText> Text;
    Descriptor Opened;
    struct stat Status = {};  // without a mode if there is no file
    State Changes = State::kUnchanged;
  };

  static bool IsCurrent(const std::string& path, const File& file);
  static void Read(const std::string& path, File& file);
  bool IsLocked(const std::string& path) const;
  Descriptor NewFileBeside(const std::string& path, mode_t mode, std::string& temporary) const;
  bool Store(const std::string& path, File& file) const;

  std::map<std::string, File> Files;
  std::map<std::string, FolderLock> Locks;
  int Depth = 0;
};
