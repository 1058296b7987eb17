#pragma once

#include <cstdint>
#include <string>
#include <string_view>

// Which of the product family's two registry layouts is read: 0 for that of versions before 9, with
// a single copy directly below the maker's key, and 1 for that since version 9, with any number of
// copies below one key. It is one value for the process, initially 1. A collection and its report
// must run with the same value.
int32_t GetCopyGeneration();
void SetCopyGeneration(int32_t generation);

// The key whose subkeys are the copies, below HKEY_LOCAL_MACHINE.
std::string GetCopiesRootKey();

// True if a subkey of that name is a copy: before version 9 only "ORX", in capital letters; since
// then every name.
bool IsCopyKey(std::string_view name);

// True if a copy's subkey of that name is a product: if it begins with "ORX" and a blank.
bool IsProductKey(std::string_view name);
