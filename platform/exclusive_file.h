#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

// A regular file opened for reading, for as long as the object lives. On Windows nobody else may
// have it open at the same time; POSIX has no such lock. A symbolic link is not followed, and
// opening a pipe or device neither succeeds nor waits.
// Windows: CreateFileA with share mode 0. POSIX: open.
class ExclusiveFile {
 public:
  explicit ExclusiveFile(const std::string& path);
  ~ExclusiveFile();
  ExclusiveFile(const ExclusiveFile&) = delete;
  ExclusiveFile& operator=(const ExclusiveFile&) = delete;

  bool IsOpen() const;

  // Fills at most size bytes of the buffer and gives how many; 0 at the end, on a failure, and
  // without an open file.
  size_t Read(char* buffer, size_t size);

 private:
  intptr_t Handle = -1;
};
