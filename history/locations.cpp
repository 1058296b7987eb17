#include "history/locations.h"

#include <algorithm>
#include <string_view>

#include "platform/files.h"
#include "platform/known_folders.h"
#include "platform/path.h"

std::string GetCommonAppDataPath() {
  const std::string folder = GetFolderPath(kCommonAppDataFolder);
  return folder.empty() ? "C:\\Documents and Settings\\All Users\\Application Data" : folder;
}

std::string GetHistoryDir() {
  return JoinPath(JoinPath(GetCommonAppDataPath(), "ZEK"), "ORXHistory");
}

std::string GetHistoryFilePath() { return JoinPath(GetHistoryDir(), "History.ini"); }

// Windows drops blanks and points from the end of a part: ".. " leads up too.
static bool LeadsUp(std::string_view part) {
  return std::count(part.begin(), part.end(), '.') >= 2 &&
         part.find_first_not_of(". ") == std::string_view::npos;
}

bool LeadsOutOfHistory(const std::string& name) {
  if (IsRootedPath(name)) {
    return true;
  }
  bool exists = true;  // false once a parent is missing: nothing below it can be a link
  for (size_t begin = 0; begin <= name.size();) {
    const size_t end = std::min(FindSeparator(name, begin), name.size());
    const std::string_view part = std::string_view(name).substr(begin, end - begin);
    if (LeadsUp(part) || !IsKeptName(part)) {
      return true;
    }
    if (exists) {
      const std::string path = JoinPath(GetHistoryDir(), name.substr(0, end));
      if (IsSymbolicLink(path)) {
        return true;
      }
      exists = KindOf(path) != FileKind::kNone;
    }
    begin = end + 1;
  }
  return false;
}

static FileKind KindOfUnquoted(std::string path) {
  if (path.starts_with('"')) {
    path.erase(0, 1);
  }
  if (path.ends_with('"')) {
    path.pop_back();
  }
  return KindOf(path);
}

bool FileExists(const std::string& path) { return KindOfUnquoted(path) == FileKind::kFile; }

bool DirExists(const std::string& path) { return KindOfUnquoted(path) == FileKind::kFolder; }

bool EnsureFolder(const std::string& path) {
  return DirExists(path) || CreateFolder(path) || DirExists(path);
}
