#include "platform/exclusive_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>

#include "platform/posix/file_calls.h"

ExclusiveFile::ExclusiveFile(const std::string& path) {
  Descriptor file = OpenFile(path, O_RDONLY | O_NOFOLLOW | O_NONBLOCK);
  struct stat status = {};
  if (file.IsOpen() && StatusOf(file, status) && S_ISREG(status.st_mode)) {
    Handle = file.Release();
    SizeInBytes = static_cast<uint64_t>(status.st_size);
  }
}

ExclusiveFile::~ExclusiveFile() {
  if (IsOpen()) {
    ::close(static_cast<int>(Handle));
  }
}

bool ExclusiveFile::IsOpen() const { return Handle >= 0; }

size_t ExclusiveFile::Read(char* buffer, size_t size) {
  const size_t most = std::min<uint64_t>(size, SizeInBytes - Offset);
  const ssize_t count =
      RetryOnInterrupt([&] { return ::read(static_cast<int>(Handle), buffer, most); });
  if (count <= 0) {
    return 0;
  }
  Offset += static_cast<uint64_t>(count);
  return static_cast<size_t>(count);
}
