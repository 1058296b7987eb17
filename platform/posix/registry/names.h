#pragma once

#include <algorithm>
#include <cstdint>
#include <string_view>

#include "platform/ascii_case.h"
#include "platform/utf8.h"

// Names of keys and values, and key paths: names with one backslash between them. All in UTF-8.

// An order that ignores case, and in which the paths below a path follow it at once.
struct TreeOrder {
  using is_transparent = void;
  bool operator()(std::string_view a, std::string_view b) const {
    const auto rank = [](char c) { return c == '\\' ? -1 : static_cast<uint8_t>(ToLowerAscii(c)); };
    return std::lexicographical_compare(a.begin(), a.end(), b.begin(), b.end(),
                                        [rank](char c, char d) { return rank(c) < rank(d); });
  }
};

inline bool IsAtOrBelow(std::string_view path, std::string_view top) {
  const bool canBe = top.empty() || path.size() == top.size() ||
                     (path.size() > top.size() && path[top.size()] == '\\');
  return canBe && EqualsIgnoringCase(path.substr(0, top.size()), top);
}

inline std::string_view FirstName(std::string_view path) { return path.substr(0, path.find('\\')); }

// Whether Windows allows the path: at most 512 names, none empty or longer than 255 characters,
// counted in UTF-16.
inline bool IsKeyPath(std::string_view path) {
  if (path.empty()) {
    return true;
  }
  for (int level = 0; level < 512; ++level) {
    const std::string_view name = FirstName(path);
    if (name.empty() || Utf16Length(name) > 255) {
      return false;
    }
    if (name.size() == path.size()) {
      return true;
    }
    path.remove_prefix(name.size() + 1);
  }
  return false;
}
