#include "platform/shared_file.h"

#include "platform/files.h"
#include "platform/windows/file_handle.h"

struct SharedFile::State {
  UniqueHandle File;
};

SharedFile::SharedFile(const std::string& path, LinkPolicy links) {
  if (links == LinkPolicy::kRefuse && IsSymbolicLink(path)) {
    return;
  }
  UniqueHandle file = OpenExisting(path, GENERIC_READ);
  if (const std::optional<uint64_t> size = RegularFileSize(file)) {
    Opened = std::make_unique<State>(State{std::move(file)});
    SizeInBytes = *size;
  }
}

SharedFile::~SharedFile() = default;

size_t SharedFile::ReadAt(uint64_t offset, char* buffer, size_t size) const {
  size_t done = 0;
  while (IsOpen() && done < size) {
    OVERLAPPED position = {};
    position.Offset = static_cast<DWORD>(offset + done);
    position.OffsetHigh = static_cast<DWORD>((offset + done) >> 32);
    const size_t count = ReadSome(Opened->File, buffer + done, size - done, &position).value_or(0);
    if (count == 0) {
      break;
    }
    done += count;
  }
  return done;
}
