#include "platform/new_file.h"

#include <fcntl.h>
#include <unistd.h>

#include "platform/posix/file_calls.h"

NewFile::NewFile(const std::string& path)
    : Path(path), Handle(OpenFile(path, O_WRONLY | O_CREAT | O_EXCL, 0600).Release()) {}

NewFile::~NewFile() {
  if (IsOpen()) {
    ::close(static_cast<int>(Handle));
    RemoveFile(Path);
  }
}

bool NewFile::IsOpen() const { return Handle >= 0; }

bool NewFile::Write(std::string_view bytes) {
  size_t written = 0;
  while (IsOpen() && written < bytes.size()) {
    const ssize_t count = RetryOnInterrupt([&] {
      return ::write(static_cast<int>(Handle), bytes.data() + written, bytes.size() - written);
    });
    if (count <= 0) {
      return false;
    }
    written += static_cast<size_t>(count);
  }
  return IsOpen();
}

bool NewFile::Finish() {
  if (!IsOpen()) {
    return false;
  }
  const int file = static_cast<int>(Handle);
  Handle = -1;
  return ::close(file) == 0;
}
