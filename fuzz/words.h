#pragma once

#include <string>
#include <string_view>
#include <vector>

// The parts of the text between the separators; a text without one is one part.
inline std::vector<std::string> Split(std::string_view text, char separator) {
  std::vector<std::string> parts(1);
  for (const char c : text) {
    if (c == separator) {
      parts.emplace_back();
    } else {
      parts.back() += c;
    }
  }
  return parts;
}
