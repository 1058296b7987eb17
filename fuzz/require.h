#pragma once

#include <cstdio>
#include <cstdlib>

// What a fuzz target checks; a failure ends the process, which the fuzzer takes for a finding.
inline void Require(bool condition, int line = __builtin_LINE()) {
  if (!condition) {
    std::fprintf(stderr, "line %d: the requirement does not hold\n", line);
    std::abort();
  }
}
