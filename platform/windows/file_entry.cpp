#include "platform/windows/file_entry.h"

UniqueSearch FindFirst(const std::string& pattern, WIN32_FIND_DATAA& first) {
  HANDLE search = ::FindFirstFileA(pattern.c_str(), &first);
  return UniqueSearch(search == INVALID_HANDLE_VALUE ? nullptr : search);
}

std::optional<WIN32_FIND_DATAA> FindEntry(const std::string& path) {
  WIN32_FIND_DATAA entry = {};
  const bool hasWildcard = path.find_first_of("*?") != std::string::npos;
  return !hasWildcard && FindFirst(path, entry) ? std::optional(entry) : std::nullopt;
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
