#include "platform/shared_file.h"

#include <fcntl.h>
#include <unistd.h>

#include "platform/posix/file_calls.h"

SharedFile::SharedFile(const std::string& path, LinkPolicy links) {
  // Without O_NONBLOCK the opening of a pipe would wait for its writer.
  const int linkFlag = links == LinkPolicy::kRefuse ? O_NOFOLLOW : 0;
  Descriptor file = OpenFile(path, O_RDONLY | O_NONBLOCK | linkFlag);
  struct stat status = {};
  if (file.IsOpen() && StatusOf(file, status) && S_ISREG(status.st_mode)) {
    Handle = file.Release();
    SizeInBytes = static_cast<uint64_t>(status.st_size);
  }
}

SharedFile::~SharedFile() {
  if (IsOpen()) {
    ::close(static_cast<int>(Handle));
  }
}

bool SharedFile::IsOpen() const { return Handle >= 0; }

size_t SharedFile::ReadAt(uint64_t offset, char* buffer, size_t size) const {
  size_t done = 0;
  while (IsOpen() && done < size) {
    const ssize_t count = RetryOnInterrupt([&] {
      return ::pread(static_cast<int>(Handle), buffer + done, size - done,
                     static_cast<off_t>(offset + done));
    });
    if (count <= 0) {
      break;
    }
    done += static_cast<size_t>(count);
  }
  return done;
}
