#include "reader/archive_names.h"

#include <algorithm>
#include <cstdint>
#include <string>
#include <unordered_set>

namespace {

using Names = std::unordered_set<std::string_view>;

// The recorder on Windows writes names in the machine's code page, where a backslash can be the
// second byte of a character. The first byte of such a character is never ASCII. After another byte
// the backslash is a separator if what is before it is the name of a folder's entry, which the
// recorder writes for every folder.
bool IsSeparator(std::string_view name, size_t at, const Names& folders) {
  return name[at] == '\\' && (at == 0 || static_cast<uint8_t>(name[at - 1]) < 0x80 ||
                              folders.empty() || folders.contains(name.substr(0, at)));
}

void ReplaceBackslashes(std::vector<ArchiveEntry>& entries) {
  std::vector<std::string> names;
  names.reserve(entries.size());
  for (const ArchiveEntry& entry : entries) {
    names.push_back(entry.Path);
  }
  Names folders;
  for (size_t i = 0; i < entries.size(); ++i) {
    if (entries[i].IsFolder) {
      folders.insert(names[i]);
    }
  }
  for (size_t i = 0; i < entries.size(); ++i) {
    for (size_t at = 0; at < names[i].size(); ++at) {
      if (IsSeparator(names[i], at, folders)) {
        entries[i].Path[at] = '/';
      }
    }
  }
}

}  // namespace

void TurnNamesToPaths(std::vector<ArchiveEntry>& entries) {
  // Windows has no name with a '/'; elsewhere a backslash is a character like others.
  const bool hasSlash = std::any_of(entries.begin(), entries.end(), [](const ArchiveEntry& entry) {
    return entry.Path.find('/') != std::string::npos;
  });
  if (!hasSlash) {
    ReplaceBackslashes(entries);
  }
  for (ArchiveEntry& entry : entries) {
    if (entry.Path.size() > 1 && entry.Path.ends_with('/')) {
      entry.Path.pop_back();
      entry.IsFolder = true;
    }
  }
}

bool HasPlainParts(std::string_view path) {
  for (size_t begin = 0; begin <= path.size();) {
    const size_t end = std::min(path.find('/', begin), path.size());
    const std::string_view part = path.substr(begin, end - begin);
    if (part.empty() || part == "." || part == ".." || part.find('\0') != std::string_view::npos) {
      return false;
    }
    begin = end + 1;
  }
  return true;
}
