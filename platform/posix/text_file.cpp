#include "platform/posix/text_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "platform/posix/file_calls.h"

std::optional<std::string> ReadAll(const Descriptor& file) {
  struct stat status = {};
  const bool isSizeKnown = StatusOf(file, status) && status.st_size > 0;
  // Spare capacity, so that a small addition by the caller does not reallocate.
  constexpr size_t spare = 4096;
  std::string text;
  text.reserve((isSizeKnown ? static_cast<size_t>(status.st_size) : 0) + spare);
  char piece[65536];
  for (;;) {
    const ssize_t count = RetryOnInterrupt([&] { return ::read(file.Get(), piece, sizeof piece); });
    if (count < 0) {
      return std::nullopt;
    }
    if (count == 0) {
      return text;
    }
    text.append(piece, static_cast<size_t>(count));
  }
}

std::optional<std::string> ReadTextFile(const std::string& path) {
  const Descriptor file = OpenFile(path, O_RDONLY);
  return file.IsOpen() ? ReadAll(file) : std::nullopt;
}

bool WriteAll(const Descriptor& file, std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t count =
        RetryOnInterrupt([&] { return ::write(file.Get(), bytes.data(), bytes.size()); });
    if (count <= 0) {
      return false;
    }
    bytes.remove_prefix(static_cast<size_t>(count));
  }
  return true;
}
