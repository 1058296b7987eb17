#pragma once

#include <string>
#include <vector>

// One registry value of a profile or of an ODBC driver.
struct CParameter {
  std::string Name;   // at most 255 bytes; empty for the value without a name
  std::string Value;  // as ReadRegistryValue returns it: empty if neither a text nor a number
};

// Appends the values of a key below HKEY_LOCAL_MACHINE, in the registry's order, to the first name
// of more than 255 bytes; nothing if the key cannot be read.
void AppendParameters(const std::string& keyPath, std::vector<CParameter>& parameters);
