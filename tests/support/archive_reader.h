#pragma once

#include <minizip/unzip.h>

#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

#include "platform/path.h"

struct ArchiveEntry {
  std::string Name;  // with slashes, whatever the platform's separator
  std::string Contents;
  unsigned long Attributes = 0;
  unsigned long Date = 0;  // as packed in the archive
  bool IsWhole = true;     // the checksum is right
};

inline ArchiveEntry ReadEntry(unzFile archive) {
  char name[8192] = {};
  unz_file_info info = {};
  unzGetCurrentFileInfo(archive, &info, name, sizeof name, nullptr, 0, nullptr, 0);
  ArchiveEntry entry{std::string(name, std::min<size_t>(info.size_filename, sizeof name)),
                     std::string(info.uncompressed_size, '\0'), info.external_fa, info.dosDate};
  std::replace(entry.Name.begin(), entry.Name.end(), kPathSeparator, '/');
  unzOpenCurrentFile(archive);
  unzReadCurrentFile(archive, entry.Contents.data(), static_cast<unsigned>(entry.Contents.size()));
  entry.IsWhole = unzCloseCurrentFile(archive) == UNZ_OK;
  return entry;
}

// Everything in the archive, in its order; nothing for a file that is no archive.
inline std::vector<ArchiveEntry> ReadArchive(const std::string& path) {
  const unzFile archive = unzOpen(path.c_str());
  std::vector<ArchiveEntry> entries;
  for (int found = unzGoToFirstFile(archive); found == UNZ_OK; found = unzGoToNextFile(archive)) {
    entries.push_back(ReadEntry(archive));
  }
  unzClose(archive);
  return entries;
}

// The entries' names, a line each, with a slash at the end of a folder's. An attribute word with
// all bits set belongs to an entry that was not found.
inline std::string ArchiveTree(const std::string& path) {
  const std::vector<ArchiveEntry> entries = ReadArchive(path);
  constexpr size_t endRecord = 22;  // an archive without entries, which minizip does not open
  std::string lines =
      entries.empty() && std::filesystem::file_size(path) != endRecord ? "none" : "";
  for (const ArchiveEntry& entry : entries) {
    lines += entry.Name + (entry.IsWhole ? "" : " (damaged)") +
             ((entry.Attributes & 0x90) == 0x10 ? "/\n" : "\n");
  }
  return lines;
}
