#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>

// A regular file opened for reading, for as long as the object lives. On Windows nobody else may
// have it open at the same time, and another program's opening of it is waited for, up to 0.2
// seconds; POSIX has no such lock. A symbolic link is not followed, and opening a pipe or device
// neither succeeds nor waits.
// Windows: CreateFileA with share mode 0, ReadFile. POSIX: open with O_NOFOLLOW, read.
class ExclusiveFile {
 public:
  explicit ExclusiveFile(const std::string& path);
  ~ExclusiveFile();
  ExclusiveFile(const ExclusiveFile&) = delete;
  ExclusiveFile& operator=(const ExclusiveFile&) = delete;

  bool IsOpen() const { return Opened != nullptr; }

  // In bytes, when it was opened; 0 without an open file.
  uint64_t Size() const { return SizeInBytes; }

  // Reads the next bytes of the file, at most size of them, into the buffer and returns how many: 0
  // at the end, after a failure and without an open file. What is appended after the opening is not
  // read, so that a file that grows all the time has an end.
  size_t Read(char* buffer, size_t size);

 private:
  struct State;  // the system's handle of the file

  std::unique_ptr<State> Opened;  // null without an open file
  uint64_t SizeInBytes = 0;
  uint64_t Offset = 0;
};
