#pragma once

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include "tests/support/file_text.h"

// What the fuzzer calls with each input; every target defines it.
void CheckInput(const std::string& input);

// A condition that must hold; its failure ends the process, which the fuzzer reports as a finding.
inline void Require(bool condition, int line = __builtin_LINE()) {
  if (!condition) {
    std::fprintf(stderr, "line %d: the requirement does not hold\n", line);
    std::abort();
  }
}

// The parts of the text between the separators; a text without one is one part.
inline std::vector<std::string> Split(std::string_view text, char separator) {
  std::vector<std::string> parts;
  for (size_t end; (end = text.find(separator)) != std::string_view::npos;) {
    parts.emplace_back(text.substr(0, end));
    text.remove_prefix(end + 1);
  }
  parts.emplace_back(text);
  return parts;
}
