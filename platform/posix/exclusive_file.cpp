#include "platform/exclusive_file.h"

#include <fcntl.h>

#include <algorithm>

#include "platform/posix/file_calls.h"

struct ExclusiveFile::State {
  Descriptor File;
};

ExclusiveFile::ExclusiveFile(const std::string& path) {
  struct stat status = {};
  Descriptor file = OpenRegularFile(path, Links::kNoFollow, status);
  if (file.IsOpen()) {
    Opened = std::make_unique<State>(State{std::move(file)});
    SizeInBytes = static_cast<uint64_t>(status.st_size);
  }
}

ExclusiveFile::~ExclusiveFile() = default;

size_t ExclusiveFile::Read(char* buffer, size_t size) {
  if (!IsOpen()) {
    return 0;
  }
  const size_t most = std::min<uint64_t>(size, SizeInBytes - Offset);
  const ssize_t count = RetryOnInterrupt([&] { return ::read(Opened->File.Get(), buffer, most); });
  if (count <= 0) {
    return 0;
  }
  Offset += static_cast<uint64_t>(count);
  return static_cast<size_t>(count);
}
