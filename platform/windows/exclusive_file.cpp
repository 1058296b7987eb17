#include "platform/exclusive_file.h"

#include <algorithm>

#include "platform/files.h"
#include "platform/windows/patience.h"

ExclusiveFile::ExclusiveFile(const std::string& path) {
  if (IsSymbolicLink(path)) {
    return;
  }
  UniqueHandle file;
  CallWithPatience(10, AccessDenied::kIsFinal, [&] {
    file = OwnIfValid(::CreateFileA(path.c_str(), GENERIC_READ, /*dwShareMode=*/0,
                                    /*lpSecurityAttributes=*/nullptr, OPEN_EXISTING,
                                    FILE_ATTRIBUTE_READONLY, /*hTemplateFile=*/nullptr));
    return file != nullptr;
  });
  LARGE_INTEGER size = {};
  if (file && ::GetFileType(file.get()) == FILE_TYPE_DISK &&
      ::GetFileSizeEx(file.get(), &size) != FALSE) {
    Handle = reinterpret_cast<intptr_t>(file.release());
    SizeInBytes = static_cast<uint64_t>(size.QuadPart);
  }
}

ExclusiveFile::~ExclusiveFile() {
  if (IsOpen()) {
    ::CloseHandle(AsHandle(Handle));
  }
}

bool ExclusiveFile::IsOpen() const { return AsHandle(Handle) != INVALID_HANDLE_VALUE; }

size_t ExclusiveFile::Read(char* buffer, size_t size) {
  constexpr uint64_t mostInOneCall = 1 << 30;
  const uint64_t most = std::min({uint64_t{size}, SizeInBytes - Offset, mostInOneCall});
  DWORD count = 0;
  if (::ReadFile(AsHandle(Handle), buffer, static_cast<DWORD>(most), &count,
                 /*lpOverlapped=*/nullptr) == FALSE) {
    return 0;
  }
  Offset += count;
  return count;
}
