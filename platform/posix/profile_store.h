#pragma once

#include <sys/stat.h>

#include <memory>
#include <string>

#include "platform/posix/descriptor.h"
#include "platform/profile_text.h"

// The profile file that this process used last, parsed, and the lock on its folder.
//
// Other processes replace the file and never change it in place, so that a text once read stays
// good as long as the name leads to the same device, inode, size and change time; that is looked at
// on every access. The file stays open as long as its text is kept: its inode number cannot come
// back as that of another file.
class ProfileStore {
 public:
  static ProfileStore& GetInstance();

  // The text as it is now: empty if there is no file, null if there is one that cannot be read.
  // Good until the next call.
  ProfileText* Load(const std::string& path);

  // Takes the lock, waiting for whoever has it. Calls nest; the first one's path counts. On a file
  // system without locks runs go on without: one may undo the change of another, but each leaves
  // a whole file.
  void Lock(const std::string& path);

  // The text that Load gave was changed, under the lock, and is to be written.
  void MarkChanged() { IsChanged = true; }

  // Frees the lock with the last call, after writing what was changed. False if that failed: then
  // the file is as it was, and so is the next Load.
  bool Unlock();

 private:
  bool IsCurrent(const std::string& path) const;
  bool Store();
  void Keep(Descriptor file);

  std::string Path;
  std::unique_ptr<ProfileText> Text;
  Descriptor File;
  struct stat Status = {};
  bool IsChanged = false;
  Descriptor Folder;
  int Depth = 0;
};
