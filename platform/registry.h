#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

// Read access to the registry below HKEY_LOCAL_MACHINE. A key path is names with one backslash
// between them; one at its end is ignored. Names are found without regard to case and returned as
// the registry stores them. What cannot be opened is empty.
//
// Windows: RegOpenKeyExA, RegQueryValueExA, RegEnumValueA, RegEnumKeyExA, RegCloseKey.
// POSIX: the registry export ZEK/Registry.reg below the common application data folder. It is
// opened by the first query, so that a run sees one state of it, and read once for each branch that
// is queried. Only the letters A to Z have two cases. docs/registry-export.md has its format.

inline constexpr uint32_t kRegistryText = 1;    // REG_SZ
inline constexpr uint32_t kRegistryNumber = 4;  // REG_DWORD

// The rights with which a key is opened. Windows opens it only if the user has all of them, so a
// user without the right to set values reads nothing with kReadAndSet. POSIX: ignored; the right to
// read the file decides.
enum class RegistryAccess : uint32_t {
  kQueryValue = 0x1,      // KEY_QUERY_VALUE
  kReadAndSet = 0x2001B,  // KEY_READ with KEY_SET_VALUE
};

struct RegistryData {
  uint32_t Type = 0;  // the registry's number for the kind of value; 0 for a missing value
  std::string Bytes;  // the stored data; empty if it is longer than the limit
};

// One value. Text is returned as narrow text (POSIX: UTF-8), with its terminating zero if it is
// stored with one; a number as four bytes, lowest first. The limit counts bytes of that form,
// terminator included.
RegistryData ReadRegistryData(const std::string& keyPath, const std::string& valueName,
                              size_t limit, RegistryAccess access);

// The names of a key's values, or of its direct subkeys, in the registry's order. The list ends
// before the first name that needs more than 256 bytes with its terminator. Opened with
// RegistryAccess::kReadAndSet.
std::vector<std::string> EnumRegistryValueNames(const std::string& keyPath);
std::vector<std::string> EnumRegistrySubKeys(const std::string& keyPath);
