#include "platform/shared_file.h"

#include "platform/posix/file_calls.h"

struct SharedFile::State {
  Descriptor File;
};

SharedFile::SharedFile(const std::string& path, LinkPolicy links) {
  struct stat status = {};
  const bool followsLinks = links == LinkPolicy::kFollow;
  Descriptor file = OpenRegularFile(path, followsLinks ? Links::kFollow : Links::kNoFollow, status);
  if (file.IsOpen()) {
    Opened = std::make_unique<State>(State{std::move(file)});
    SizeInBytes = static_cast<uint64_t>(status.st_size);
  }
}

SharedFile::~SharedFile() = default;

size_t SharedFile::ReadAt(uint64_t offset, char* buffer, size_t size) const {
  size_t done = 0;
  while (IsOpen() && done < size) {
    const ssize_t count = RetryOnInterrupt([&] {
      return ::pread(Opened->File.Get(), buffer + done, size - done,
                     static_cast<off_t>(offset + done));
    });
    if (count <= 0) {
      break;
    }
    done += static_cast<size_t>(count);
  }
  return done;
}
