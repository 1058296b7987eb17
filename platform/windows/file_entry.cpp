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
  // Other reparse points stand for the file itself, stored elsewhere.
  return (entry.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0 &&
         (entry.dwReserved0 == IO_REPARSE_TAG_SYMLINK ||
          entry.dwReserved0 == IO_REPARSE_TAG_MOUNT_POINT);
}

void RemoveFile(const std::string& path) {
  ::SetFileAttributesA(path.c_str(), FILE_ATTRIBUTE_NORMAL);
  ::DeleteFileA(path.c_str());
}
