#include "platform/path.h"

#include <unistd.h>

#include <climits>

const char kPathSeparator = '/';
const std::string_view kPathSeparators = "/";

bool IsLeadByte(char /*byte*/) { return false; }

bool IsRootedPath(const std::string& path) { return path.starts_with('/'); }

bool IsKeptName(std::string_view /*part*/) { return true; }

bool FitsPathLimit(const std::string& path) { return path.size() < PATH_MAX; }

std::optional<std::string> AbsolutePath(const std::string& path) {
  if (path.empty()) {
    return std::nullopt;
  }
  if (IsRootedPath(path)) {
    return path;
  }
  char folder[PATH_MAX];
  if (::getcwd(folder, sizeof folder) == nullptr) {
    return std::nullopt;
  }
  return std::string(folder) + '/' + path;
}
