#include "platform/windows/file_replacement.h"

#include <algorithm>
#include <cstdint>
#include <optional>

#include "platform/windows/file_handle.h"
#include "platform/windows/patience.h"

bool FlushToDisk(const std::string& path) {
  const UniqueHandle file = OpenPatiently(kLongPatience, path, GENERIC_WRITE);
  return file && CallWithPatience(kLongPatience, AccessDenied::kIsFinal,
                                  [&] { return ::FlushFileBuffers(file.get()) != FALSE; });
}

bool RenameOver(const std::string& source, const std::string& target) {
  return CallWithPatience(kLongPatience, AccessDenied::kMayPass, [&] {
    return ::MoveFileExA(source.c_str(), target.c_str(),
                         MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH) != FALSE;
  });
}

static bool SetOffset(const UniqueHandle& file, uint64_t offset) {
  LARGE_INTEGER distance = {};
  distance.QuadPart = static_cast<LONGLONG>(offset);
  return ::SetFilePointerEx(file.get(), distance, /*lpNewFilePointer=*/nullptr, FILE_BEGIN) !=
         FALSE;
}

static bool SetSize(const UniqueHandle& file, uint64_t size) {
  return SetOffset(file, size) && ::SetEndOfFile(file.get()) != FALSE;
}

static bool WriteInto(const std::string& source, const std::string& target) {
  const UniqueHandle from = OpenPatiently(kLongPatience, source, GENERIC_READ);
  const UniqueHandle to = OpenPatiently(kLongPatience, target, GENERIC_WRITE);
  const std::optional<uint64_t> newSize = RegularFileSize(from);
  const std::optional<uint64_t> oldSize = RegularFileSize(to);
  if (!newSize || !oldSize) {
    return false;
  }
  // Takes the space first, so that a full disk is noticed while the old contents are still there.
  if (!SetSize(to, std::max(*oldSize, *newSize))) {
    SetSize(to, *oldSize);
    return false;
  }
  return SetOffset(to, 0) && CopyBytes(from, *newSize, to) && SetSize(to, *newSize) &&
         ::FlushFileBuffers(to.get()) != FALSE;
}

bool ReplaceFileBy(const std::string& source, const std::string& target) {
  return FlushToDisk(source) && (RenameOver(source, target) || WriteInto(source, target));
}
