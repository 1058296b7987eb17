#pragma once

#include <string>

// The data of one registry value as text: of a text, what stands in front of its first zero byte;
// of a number, its decimal digits as a signed one. Empty for a value of any other kind, for a value
// or key that is missing, and for data of more than 100 bytes, terminator included.
std::string ReadRegistryValue(const std::string& keyPath, const std::string& valueName);
