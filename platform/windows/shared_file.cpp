#include "platform/shared_file.h"

#include <algorithm>

#include "platform/files.h"
#include "platform/windows/system.h"

SharedFile::SharedFile(const std::string& path, LinkPolicy links) {
  if (links == LinkPolicy::kRefuse && IsSymbolicLink(path)) {
    return;
  }
  UniqueHandle file = OwnIfValid(::CreateFileA(
      path.c_str(), GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
      /*lpSecurityAttributes=*/nullptr, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL,
      /*hTemplateFile=*/nullptr));
  LARGE_INTEGER size = {};
  if (file && ::GetFileType(file.get()) == FILE_TYPE_DISK &&
      ::GetFileSizeEx(file.get(), &size) != FALSE) {
    SizeInBytes = static_cast<uint64_t>(size.QuadPart);
    Handle = reinterpret_cast<intptr_t>(file.release());
  }
}

SharedFile::~SharedFile() {
  if (IsOpen()) {
    ::CloseHandle(AsHandle(Handle));
  }
}

bool SharedFile::IsOpen() const { return AsHandle(Handle) != INVALID_HANDLE_VALUE; }

size_t SharedFile::ReadAt(uint64_t offset, char* buffer, size_t size) const {
  size_t done = 0;
  while (IsOpen() && done < size) {
    constexpr size_t most = 1 << 30;  // in one call
    OVERLAPPED position = {};
    position.Offset = static_cast<DWORD>(offset + done);
    position.OffsetHigh = static_cast<DWORD>((offset + done) >> 32);
    DWORD count = 0;
    if (::ReadFile(AsHandle(Handle), buffer + done, static_cast<DWORD>(std::min(size - done, most)),
                   &count, &position) == FALSE ||
        count == 0) {
      break;
    }
    done += count;
  }
  return done;
}
