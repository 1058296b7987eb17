#pragma once

#include <cstdint>
#include <string>
#include <string_view>

// Which of the product family's two registry layouts is looked at: 0 for the one before version 9,
// with a single copy right below the maker's key, and 1 for the one since, with any number of
// copies side by side. One value for the process, 1 when it starts. A collection and the report
// of it must run under the same value.
int32_t GetCopyGeneration();
void SetCopyGeneration(int32_t generation);

// The key whose subkeys are the copies, below HKEY_LOCAL_MACHINE.
std::string GetCopiesRootKey();

// True if a subkey of that name is a copy: before version 9 only "ORX" itself, in this case and
// with nothing behind it; since then every name.
bool IsCopyKey(std::string_view name);

// True if a copy's subkey of that name is a product: one that begins with "ORX" and a blank.
bool IsProductKey(std::string_view name);
