#pragma once

#include <string>
#include <vector>

// One value of a profile or of an ODBC driver.
struct CParameter {
  std::string Name;
  std::string Value;  // empty for a kind of value that is neither text nor number
};

// Appends every value of a key, in the registry's order; nothing for a key that cannot be read.
void AppendParameters(const std::string& keyPath, std::vector<CParameter>& parameters);
