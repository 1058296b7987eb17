#include "report/zip_names.h"

#include <algorithm>
#include <string_view>

#include "platform/ascii_case.h"
#include "platform/path.h"

static constexpr std::string_view whiteSpace = " \t\n\v\f\r";

std::string TrimTail(const std::string& text) {
  std::string_view rest = text;
  while (rest.size() > 1 && whiteSpace.find(rest.back()) != std::string_view::npos) {
    rest.remove_suffix(1);
  }
  while (rest.size() > 1 && rest.back() == kPathSeparator) {
    rest.remove_suffix(1);
  }
  return std::string(rest);
}

std::string TrimHead(const std::string& text) {
  std::string_view rest = text;
  rest.remove_prefix(std::min(rest.find_first_not_of(whiteSpace), rest.size()));
  rest.remove_prefix(std::min(rest.find_first_not_of(kPathSeparator), rest.size()));
  return std::string(rest);
}

static bool IsSeparator(char c) { return kPathSeparators.find(c) != std::string_view::npos; }

std::string MakePath(const std::string& folder, const std::string& name) {
  const bool needsSeparator = !folder.empty() && !IsSeparator(folder.back());
  return needsSeparator ? folder + kPathSeparator + name : folder + name;
}

// Where the last part begins: behind the last separator, or behind the drive's colon. A path can be
// rooted without a leading separator only on a system with drives.
static size_t LastPart(const std::string& path) {
  const size_t separator = path.find_last_of(kPathSeparators);
  if (separator != std::string::npos) {
    return separator + 1;
  }
  return IsRootedPath(path) && path.find(':') == 1 ? 2 : 0;
}

std::string FolderPart(const std::string& path) { return path.substr(0, LastPart(path)); }

std::string BaseName(const std::string& path) { return path.substr(LastPart(path)); }

std::string ReplaceExtension(const std::string& path, const std::string& extension) {
  const std::string name = BaseName(path);
  return FolderPart(path) + name.substr(0, name.rfind('.')) + extension;
}

std::optional<std::string> CutFolder(const std::string& path, const std::string& folder) {
  const std::string_view head = std::string_view(path).substr(0, folder.size());
  return EqualsIgnoringCase(head, folder) ? std::optional(path.substr(folder.size()))
                                          : std::nullopt;
}
