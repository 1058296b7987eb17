#pragma once

#include <gtest/gtest.h>
#include <minizip/unzip.h>

#include <algorithm>
#include <cstdint>
#include <fstream>
#include <string>
#include <vector>

#include "platform/path.h"

struct ArchiveEntry {
  std::string Name;  // with slashes, whatever the platform's separator
  std::string Contents;
  uint32_t Attributes = 0;
  tm_unz Date = {};
};

inline ArchiveEntry ReadEntry(unzFile archive) {
  char name[4096] = {};
  unz_file_info info = {};
  EXPECT_EQ(unzGetCurrentFileInfo(archive, &info, name, sizeof name, nullptr, 0, nullptr, 0),
            UNZ_OK);
  ArchiveEntry entry{name, std::string(info.uncompressed_size, '\0'),
                     static_cast<uint32_t>(info.external_fa), info.tmu_date};
  std::replace(entry.Name.begin(), entry.Name.end(), kPathSeparator, '/');
  EXPECT_EQ(unzOpenCurrentFile(archive), UNZ_OK);
  EXPECT_EQ(unzReadCurrentFile(archive, entry.Contents.data(),
                               static_cast<unsigned>(entry.Contents.size())),
            static_cast<int>(entry.Contents.size()));
  EXPECT_EQ(unzCloseCurrentFile(archive), UNZ_OK);  // the checksum fits
  return entry;
}

// An archive of nothing but its end record, which minizip's reader takes for no archive at all.
inline bool IsEmptyArchive(const std::string& path) {
  std::string text(32, '\0');
  std::ifstream file(path, std::ios::binary);
  file.read(text.data(), 32);
  return file.gcount() == 22 && text.starts_with("PK\5\6");
}

// Everything in the archive, in its order, checksums tried.
inline std::vector<ArchiveEntry> ReadArchive(const std::string& path) {
  if (IsEmptyArchive(path)) {
    return {};
  }
  const unzFile archive = unzOpen(path.c_str());
  EXPECT_NE(archive, nullptr) << path;
  std::vector<ArchiveEntry> entries;
  if (archive == nullptr) {
    return entries;
  }
  for (int found = unzGoToFirstFile(archive); found == UNZ_OK; found = unzGoToNextFile(archive)) {
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
