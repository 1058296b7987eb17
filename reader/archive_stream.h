#pragma once

#include <minizip/unzip.h>

#include <vector>

#include "reader/archive.h"

// The file functions through which minizip reads the bytes of an archive. It reads single bytes and
// seeks back and forth, so a window of the bytes is kept in memory.
class Archive::Stream {
 public:
  explicit Stream(ArchiveBytes bytes) : Bytes(std::move(bytes)) {}

  // Valid as long as this object lives and is not moved.
  zlib_filefunc64_def Functions();

 private:
  size_t Read(char* buffer, size_t size);
  bool Seek(uint64_t offset, int origin);

  ArchiveBytes Bytes;
  uint64_t Offset = 0;
  uint64_t WindowOffset = 0;
  size_t WindowSize = 0;  // the bytes of the window that are in use
  std::vector<char> Window = std::vector<char>(1 << 16);
};
