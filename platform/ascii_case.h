#pragma once

#include <algorithm>
#include <string>
#include <string_view>

// Comparison that ignores the case of the letters A to Z and of no others, whatever the locale.

constexpr char ToLowerAscii(char c) {
  return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

inline std::string LoweredAscii(std::string_view text) {
  std::string lowered(text);
  std::transform(lowered.begin(), lowered.end(), lowered.begin(), ToLowerAscii);
  return lowered;
}

inline bool EqualsIgnoringCase(std::string_view a, std::string_view b) {
  return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                    [](char x, char y) { return ToLowerAscii(x) == ToLowerAscii(y); });
}

// Removes the prefix from the text if the text begins with it; else false, and the text is as it
// was.
inline bool TakePrefixIgnoringCase(std::string_view& text, std::string_view prefix) {
  // Most texts have the case of the prefix, and that comparison is fast.
  if (!text.starts_with(prefix) && !EqualsIgnoringCase(text.substr(0, prefix.size()), prefix)) {
    return false;
  }
  text.remove_prefix(prefix.size());
  return true;
}
