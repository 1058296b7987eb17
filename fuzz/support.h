#pragma once

#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

// What a fuzz target checks; a failure ends the process, which the fuzzer reports as a finding.
inline void Require(bool condition, int line = __builtin_LINE()) {
  if (!condition) {
    std::fprintf(stderr, "line %d: the requirement does not hold\n", line);
    std::abort();
  }
}

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
