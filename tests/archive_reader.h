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
  tm_unz Date = {};
};

inline ArchiveEntry ReadEntry(unzFile archive) {
  char name[4096] = {};
  unz_file_info info = {};
  unzGetCurrentFileInfo(archive, &info, name, sizeof name, nullptr, 0, nullptr, 0);
  ArchiveEntry entry{name, std::string(info.uncompressed_size, '\0'), info.external_fa,
                     info.tmu_date};
  std::replace(entry.Name.begin(), entry.Name.end(), kPathSeparator, '/');
  unzOpenCurrentFile(archive);
  unzReadCurrentFile(archive, entry.Contents.data(), static_cast<unsigned>(entry.Contents.size()));
  EXPECT_EQ(unzCloseCurrentFile(archive), UNZ_OK) << name;  // the checksum fits
  return entry;
}

// Everything in the archive, in its order.
inline std::vector<ArchiveEntry> ReadArchive(const std::string& path) {
  constexpr size_t endRecord = 22;  // alone, minizip's reader takes it for no archive
  if (std::filesystem::file_size(path) == endRecord) {
    return {};
  }
  const unzFile archive = unzOpen(path.c_str());
  EXPECT_NE(archive, nullptr) << path;
  std::vector<ArchiveEntry> entries;
  int found = archive == nullptr ? UNZ_ERRNO : unzGoToFirstFile(archive);
  for (; found == UNZ_OK; found = unzGoToNextFile(archive)) {
    entries.push_back(ReadEntry(archive));
  }
  unzClose(archive);
  return entries;
}

inline std::vector<std::string> ArchiveNames(const std::string& path) {
  std::vector<std::string> names;
  for (const ArchiveEntry& entry : ReadArchive(path)) {
    names.push_back(entry.Name);
  }
  return names;
}
