#include "platform/exclusive_file.h"

#include <algorithm>

#include "platform/files.h"
#include "platform/windows/file_handle.h"
#include "platform/windows/patience.h"

struct ExclusiveFile::State {
  UniqueHandle File;
};

ExclusiveFile::ExclusiveFile(const std::string& path) {
  if (IsSymbolicLink(path)) {
    return;
  }
  UniqueHandle file =
      OpenPatiently(kShortPatience, path, GENERIC_READ, /*share=*/0, FILE_ATTRIBUTE_READONLY);
  if (const std::optional<uint64_t> size = RegularFileSize(file)) {
    Opened = std::make_unique<State>(State{std::move(file)});
    SizeInBytes = *size;
  }
}

ExclusiveFile::~ExclusiveFile() = default;

size_t ExclusiveFile::Read(char* buffer, size_t size) {
  if (!IsOpen()) {
    return 0;
  }
  const auto most = static_cast<size_t>(std::min<uint64_t>(size, SizeInBytes - Offset));
  const size_t count = ReadSome(Opened->File, buffer, most).value_or(0);
  Offset += count;
  return count;
}
