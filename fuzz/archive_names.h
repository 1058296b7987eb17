#pragma once

#include <minizip/unzip.h>

#include <string>
#include <vector>

// The entry names of an archive, in its order.
inline std::vector<std::string> ArchiveNames(const std::string& path) {
  std::vector<std::string> names;
  const unzFile archive = unzOpen(path.c_str());
  int found = archive == nullptr ? UNZ_ERRNO : unzGoToFirstFile(archive);
  for (; found == UNZ_OK; found = unzGoToNextFile(archive)) {
    unz_file_info info = {};
    unzGetCurrentFileInfo(archive, &info, nullptr, 0, nullptr, 0, nullptr, 0);
    std::string name(info.size_filename, '\0');
    unzGetCurrentFileInfo(archive, &info, name.data(), name.size(), nullptr, 0, nullptr, 0);
    names.push_back(name);
  }
  unzClose(archive);
  return names;
}
