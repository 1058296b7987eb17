#include "platform/exclusive_file.h"

#include <algorithm>

#include "platform/files.h"
#include "platform/windows/system.h"

static HANDLE AsHandle(intptr_t number) { return reinterpret_cast<HANDLE>(number); }

ExclusiveFile::ExclusiveFile(const std::string& path) {
  if (IsSymbolicLink(path)) {
    return;
  }
  UniqueHandle file = OwnIfValid(::CreateFileA(path.c_str(), GENERIC_READ, /*dwShareMode=*/0,
                                               /*lpSecurityAttributes=*/nullptr, OPEN_EXISTING,
                                               FILE_ATTRIBUTE_READONLY, /*hTemplateFile=*/nullptr));
  if (file && ::GetFileType(file.get()) == FILE_TYPE_DISK) {
    Handle = reinterpret_cast<intptr_t>(file.release());
  }
}

ExclusiveFile::~ExclusiveFile() {
  if (IsOpen()) {
    ::CloseHandle(AsHandle(Handle));
  }
}

bool ExclusiveFile::IsOpen() const { return AsHandle(Handle) != INVALID_HANDLE_VALUE; }

size_t ExclusiveFile::Read(char* buffer, size_t size) {
  constexpr size_t most = 1 << 30;
  DWORD count = 0;
  const BOOL isRead = ::ReadFile(AsHandle(Handle), buffer, static_cast<DWORD>(std::min(size, most)),
                                 &count, /*lpOverlapped=*/nullptr);
  return isRead == FALSE ? 0 : count;
}
