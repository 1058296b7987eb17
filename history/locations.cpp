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

std::string GetMakerDir() { return JoinPath(GetCommonAppDataPath(), "ZEK"); }

std::string GetHistoryDir() { return JoinPath(GetMakerDir(), "ORXHistory"); }

std::string GetHistoryFilePath() { return JoinPath(GetHistoryDir(), "History.ini"); }

bool EnsureHistoryDir(std::string& failed) {
  for (const std::string& path : {GetMakerDir(), GetHistoryDir()}) {
    if (!EnsureFolder(path) || IsSymbolicLink(path)) {
      failed = path;
      return false;
    }
  }
  return true;
}

bool HistoryDirExists() {
  return DirExists(GetHistoryDir()) && !IsSymbolicLink(GetMakerDir()) &&
         !IsSymbolicLink(GetHistoryDir());
}

// Windows drops blanks and dots from the end of a part: ".. " leads up too.
static bool LeadsUp(std::string_view part) {
  return std::count(part.begin(), part.end(), '.') >= 2 &&
         part.find_first_not_of(". ") == std::string_view::npos;
}

bool LeadsElsewhere(const std::string& name) {
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

bool CanHoldEvent(const std::string& name) {
  const std::string log = JoinPath(JoinPath(GetHistoryDir(), name), "ORXInstallEvent.Log");
  return !LeadsElsewhere(name) && FitsPathLimit(log);
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
