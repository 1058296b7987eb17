#pragma once

#include <gtest/gtest.h>
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
};

inline ArchiveEntry ReadEntry(unzFile archive) {
  char name[4096] = {};
  unz_file_info info = {};
  unzGetCurrentFileInfo(archive, &info, name, sizeof name, nullptr, 0, nullptr, 0);
  ArchiveEntry entry{name, std::string(info.uncompressed_size, '\0'), info.external_fa,
                     info.dosDate};
  std::replace(entry.Name.begin(), entry.Name.end(), kPathSeparator, '/');
  unzOpenCurrentFile(archive);
  unzReadCurrentFile(archive, entry.Contents.data(), static_cast<unsigned>(entry.Contents.size()));
  EXPECT_EQ(unzCloseCurrentFile(archive), UNZ_OK) << name;  // the checksum fits
  return entry;
}

// Everything in the archive, in its order.
inline std::vector<ArchiveEntry> ReadArchive(const std::string& path) {
  constexpr size_t endRecord = 22;  // alone, minizip's reader takes it for no archive
  const bool isEmpty = std::filesystem::file_size(path) == endRecord;
  const unzFile archive = isEmpty ? nullptr : unzOpen(path.c_str());
  EXPECT_EQ(archive == nullptr, isEmpty) << path;
  std::vector<ArchiveEntry> entries;
  for (int found = unzGoToFirstFile(archive); found == UNZ_OK; found = unzGoToNextFile(archive)) {
    entries.push_back(ReadEntry(archive));
  }
  unzClose(archive);
  return entries;
}

// The entries' names, a line each, with a slash at the end of a folder's. An attribute word with
// all bits set is of something that was not found.
inline std::string ArchiveTree(const std::string& path) {
  std::string lines;
  for (const ArchiveEntry& entry : ReadArchive(path)) {
    lines += entry.Name + ((entry.Attributes & 0x90) == 0x10 ? "/\n" : "\n");
  }
  return lines;
}
