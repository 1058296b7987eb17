#include "platform/path.h"

static bool IsSeparator(char c) { return kPathSeparators.find(c) != std::string_view::npos; }

size_t FindSeparator(std::string_view path, size_t begin) {
  for (size_t i = begin; i < path.size(); ++i) {
    if (IsSeparator(path[i])) {
      return i;
    }
    if (IsLeadByte(path[i])) {
      ++i;
    }
  }
  return std::string_view::npos;
}

size_t AfterLastSeparator(std::string_view path) {
  size_t after = 0;
  for (size_t found = FindSeparator(path); found != std::string_view::npos;
       found = FindSeparator(path, after)) {
    after = found + 1;
  }
  return after;
}

bool EndsWithSeparator(std::string_view path) {
  return !path.empty() && AfterLastSeparator(path) == path.size();
}

std::string JoinPath(const std::string& folder, const std::string& name) {
  const bool needsSeparator = !folder.empty() && !EndsWithSeparator(folder);
  return needsSeparator ? folder + kPathSeparator + name : folder + name;
}

// A path without a separator can be rooted only on a system with drives.
static size_t LastPart(const std::string& path) {
  const size_t after = AfterLastSeparator(path);
  return after == 0 && IsRootedPath(path) && path.find(':') == 1 ? 2 : after;
}

std::string FolderPart(const std::string& path) { return path.substr(0, LastPart(path)); }

std::string BaseName(const std::string& path) { return path.substr(LastPart(path)); }
