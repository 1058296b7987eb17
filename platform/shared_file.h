#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>

enum class LinkPolicy { kFollow, kRefuse };

// A regular file opened for reading at any offset, for as long as the object lives. It takes no
// lock: other programs may read, write, rename and remove the file meanwhile. What is not a regular
// file (a folder, a pipe, a device) is not opened, and the attempt does not wait.
// Windows: CreateFileA with every share mode, ReadFile. POSIX: open, pread.
class SharedFile {
 public:
  // With kRefuse a path whose last part is a symbolic link (Windows: or a junction) is not opened.
  SharedFile(const std::string& path, LinkPolicy links);
  ~SharedFile();
  SharedFile(const SharedFile&) = delete;
  SharedFile& operator=(const SharedFile&) = delete;

  bool IsOpen() const { return Opened != nullptr; }

  // In bytes, when it was opened; 0 without an open file.
  uint64_t Size() const { return SizeInBytes; }

  // Reads at most size bytes from the offset on into the buffer and returns how many: fewer at the
  // end of the file and after a failure, 0 without an open file.
  size_t ReadAt(uint64_t offset, char* buffer, size_t size) const;

 private:
  struct State;  // the system's handle of the file

  std::unique_ptr<State> Opened;  // null without an open file
  uint64_t SizeInBytes = 0;
};
