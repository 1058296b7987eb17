#pragma once

#include <cstdlib>

// What a fuzz target checks; a failure ends the process, which the fuzzer takes for a finding.
inline void Require(bool condition) {
  if (!condition) {
    std::abort();
  }
}
