#pragma once

#include <string>

// The data of one registry value below HKEY_LOCAL_MACHINE as text: a text up to its first zero
// byte; a number in decimal digits, as a signed one. Empty for a value of any other kind, for a
// missing value or key, and for data of more than 100 bytes, terminator included. Read through
// ReadRegistryData (platform/registry.h).
std::string ReadRegistryValue(const std::string& keyPath, const std::string& valueName);
