#include "platform/new_file.h"

#include <algorithm>

#include "platform/windows/file_entry.h"
#include "platform/windows/system.h"

NewFile::NewFile(const std::string& path) : Path(path) {
  UniqueHandle file = OwnIfValid(::CreateFileA(path.c_str(), GENERIC_WRITE, /*dwShareMode=*/0,
                                               /*lpSecurityAttributes=*/nullptr, CREATE_NEW,
                                               FILE_ATTRIBUTE_NORMAL, /*hTemplateFile=*/nullptr));
  if (file && ::GetFileType(file.get()) == FILE_TYPE_DISK) {
    Handle = reinterpret_cast<intptr_t>(file.release());
  }
}

NewFile::~NewFile() {
  if (IsOpen()) {
    ::CloseHandle(AsHandle(Handle));
    RemoveFile(Path);
  }
}

bool NewFile::IsOpen() const { return AsHandle(Handle) != INVALID_HANDLE_VALUE; }

bool NewFile::Write(std::string_view bytes) {
  while (IsOpen() && !bytes.empty()) {
    constexpr size_t most = 1 << 30;  // in one call
    DWORD count = 0;
    if (::WriteFile(AsHandle(Handle), bytes.data(),
                    static_cast<DWORD>(std::min(bytes.size(), most)), &count,
                    /*lpOverlapped=*/nullptr) == FALSE ||
        count == 0) {
      return false;
    }
    bytes.remove_prefix(count);
  }
  return IsOpen();
}

bool NewFile::Finish() {
  if (!IsOpen()) {
    return false;
  }
  const HANDLE file = AsHandle(Handle);
  Handle = -1;
  return ::CloseHandle(file) != FALSE;
}
