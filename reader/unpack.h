#pragma once

#include <functional>
#include <string>
#include <vector>

// Restores the tree of an archive as files and folders below a folder, which is made if it is not
// there. What leads out of it, has a name that this system does not keep, is a link, is there
// already or cannot be unpacked whole is left out, and the others are restored.
struct UnpackResult {
  bool IsDone = false;  // false if nothing could be done; then Error says why and what to do
  std::string Error;
  size_t Restored = 0;               // files
  std::vector<std::string> LeftOut;  // a sentence each, UTF-8
};

// Calls the function after each file.
UnpackResult UnpackArchive(const std::string& archive, const std::string& folder,
                           const std::function<void()>& onFile);
