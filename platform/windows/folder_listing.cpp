#include "platform/folder_listing.h"

#include "platform/windows/file_entry.h"

std::vector<FolderEntry> ListFolder(const std::string& path) {
  std::vector<FolderEntry> entries;
  WIN32_FIND_DATAA entry = {};
  const UniqueSearch search = FindFirst(path + "\\*.*", entry);
  for (bool isFound = search != nullptr; isFound;
       isFound = ::FindNextFileA(search.get(), &entry) != FALSE) {
    if (!IsLink(entry)) {
      const uint64_t size = (uint64_t{entry.nFileSizeHigh} << 32) | entry.nFileSizeLow;
      entries.push_back({entry.cFileName, size, entry.dwFileAttributes});
    }
  }
  return entries;
}

std::optional<uint32_t> FileAttributes(const std::string& path) {
  const DWORD attributes = ::GetFileAttributesA(path.c_str());
  return attributes == INVALID_FILE_ATTRIBUTES ? std::nullopt : std::optional<uint32_t>(attributes);
}

std::optional<CalendarTime> LastWriteTime(const std::string& path) {
  const std::optional<WIN32_FIND_DATAA> entry = FindEntry(path);
  FILETIME local = {};
  SYSTEMTIME fields = {};
  if (!entry || ::FileTimeToLocalFileTime(&entry->ftLastWriteTime, &local) == FALSE ||
      ::FileTimeToSystemTime(&local, &fields) == FALSE) {
    return std::nullopt;
  }
  return CalendarTime{fields.wYear, fields.wMonth,  fields.wDay,
                      fields.wHour, fields.wMinute, fields.wSecond};
}
