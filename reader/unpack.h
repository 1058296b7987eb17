#pragma once

#include <functional>
#include <string>
#include <vector>

struct UnpackResult {
  bool IsDone = false;  // false if nothing could be done; then Error says why and what to do
  std::string Error;
  size_t Restored = 0;               // files
  std::vector<std::string> LeftOut;  // a sentence each, UTF-8
};

// Restores the tree of an archive as files and folders below a folder, which is created if it does
// not exist. An entry that leads out of the folder, has a name that this system does not keep, is a
// link, exists already or cannot be unpacked whole is left out, and the others are restored. Calls
// the function after each entry.
UnpackResult UnpackArchive(const std::string& archive, const std::string& folder,
                           const std::function<void()>& onFile);
