#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "platform/posix/registry_headings.h"

// A stretch of an export whose keys all lie in one part of the registry.
struct RegistryStretch {
  HeadingKind Kind;    // kOther if they do not lie below HKEY_LOCAL_MACHINE
  std::string Part;    // the first three names of their paths, or the whole path if it has fewer
  uint64_t Begin = 0;  // of the first heading
  uint64_t End = 0;
};

// The stretches of a whole export, in its order. As an export is written key by key down the tree,
// they are few, and what is remembered of half a million keys is small.
std::vector<RegistryStretch> MapRegistry(RegistryHeadings& headings, uint64_t begin);
