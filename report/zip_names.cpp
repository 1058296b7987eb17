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
  const size_t last = rest.find_last_not_of(kPathSeparator);
  if (last == std::string_view::npos) {
    return std::string(rest.substr(0, 1));
  }
  // After a lead byte, the first "separator" is the second byte of a character.
  const bool isTrimmed = EndsWithSeparator(rest.substr(0, last + 2));
  return std::string(rest.substr(0, isTrimmed ? last + 1 : last + 2));
}

std::string TrimHead(const std::string& text) {
  std::string_view rest = text;
  rest.remove_prefix(std::min(rest.find_first_not_of(whiteSpace), rest.size()));
  rest.remove_prefix(std::min(rest.find_first_not_of(kPathSeparator), rest.size()));
  return std::string(rest);
}

std::string ReplaceExtension(const std::string& path, const std::string& extension) {
  const std::string name = BaseName(path);
  return FolderPart(path) + name.substr(0, name.rfind('.')) + extension;
}

std::optional<std::string> CutFolder(const std::string& path, const std::string& folder) {
  std::string_view rest = path;
  return TakePrefixIgnoringCase(rest, folder) ? std::optional(std::string(rest)) : std::nullopt;
}
