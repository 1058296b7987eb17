#include "platform/windows/file_entry.h"

std::optional<WIN32_FIND_DATAA> FindEntry(const std::string& path) {
  WIN32_FIND_DATAA entry = {};
  if (path.find_first_of("*?") != std::string::npos) {
    return std::nullopt;
  }
  const HANDLE search = ::FindFirstFileA(path.c_str(), &entry);
  if (search == INVALID_HANDLE_VALUE) {
    return std::nullopt;
  }
  ::FindClose(search);
  return entry;
}

bool IsLink(const WIN32_FIND_DATAA& entry) {
  // The bit of tags that refer to another named file; symbolic links and junctions have it.
  constexpr DWORD nameSurrogate = 0x20000000;
  const DWORD tag = entry.dwReserved0;
  return (entry.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0 &&
         ((tag & nameSurrogate) != 0 || tag == IO_REPARSE_TAG_RESERVED_ZERO);
}

void RemoveFile(const std::string& path) {
  ::SetFileAttributesA(path.c_str(), FILE_ATTRIBUTE_NORMAL);
  ::DeleteFileA(path.c_str());
}
