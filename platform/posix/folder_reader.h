#pragma once

#include <dirent.h>

#include <memory>
#include <string>

#include "platform/posix/descriptor.h"

// Reads the names in a folder one after another, in the order of the file system.
class FolderReader {
 public:
  explicit FolderReader(const std::string& path)
      : Folder(RetryOnInterrupt([&path] { return ::opendir(path.c_str()); })) {}

  bool IsOpen() const { return Folder != nullptr; }

  // The folder's descriptor, for calls on its entries; only for an open folder.
  int Get() const { return ::dirfd(Folder.get()); }

  // The name of the next entry, valid until the next call; null after the last one, after a failure
  // and without an open folder.
  const char* Next() {
    if (!IsOpen()) {
      return nullptr;
    }
    const dirent* entry = RetryOnInterrupt([this] { return ::readdir(Folder.get()); });
    return entry == nullptr ? nullptr : entry->d_name;
  }

 private:
  struct Closer {
    void operator()(DIR* folder) const { ::closedir(folder); }
  };
  std::unique_ptr<DIR, Closer> Folder;
};
