#pragma once

#include <string>

#include "platform/windows/system.h"

// The guard that this process holds, and the copy of the profile file that takes what is written
// under it.
//
// The system's calls rewrite a profile file in place and lose keys when two processes do so at
// once. So every access, a read too, is made under the guard; and the writes go to a copy beside
// the file, which replaces it when the guard ends. The copy's name begins with a dot. One that a
// killed process left is removed by the next change. Where the system refuses the mutex, accesses
// are made without it.
class ProfileStore {
 public:
  static ProfileStore& GetInstance();

  // Takes the guard, waiting for whoever has it. Calls nest; the first one's path counts.
  void Lock(const std::string& path);

  // The file to read, and the file to write; empty if the copy cannot be made. Only under the
  // guard.
  const std::string& ForReading(const std::string& path) const;
  std::string ForWriting(const std::string& path);

  // A write has failed: nothing of what this guard has written counts.
  void MarkFailed();

  // Frees the guard with the last call, after putting the copy in the file's place. False if that
  // failed: then the file is as it was.
  bool Unlock();

 private:
  enum class State { kUnchanged, kChanged, kFailed };

  ProfileStore();
  bool MakeCopy();
  bool Store() const;

  UniqueHandle Mutex;
  int Depth = 0;
  std::string Path;
  std::string Growing;
  State Changes = State::kUnchanged;
};
