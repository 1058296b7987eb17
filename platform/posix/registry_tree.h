#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/posix/registry_headings.h"
#include "platform/posix/registry_lines.h"
#include "platform/posix/registry_names.h"

// The keys of one branch of the registry. They lie side by side and name each other by number, so
// that no depth of the tree is a depth of calls.
class RegistryTree {
 public:
  struct Key {
    RegistryNames<size_t> SubKeys;           // their numbers
    std::vector<RegistryHeading> Headings;   // each with lines that say values of this key
    std::unique_ptr<RegistryValues> Values;  // what they say, once somebody has asked
  };

  // Takes the headings at and below the branch's top in their order.
  RegistryTree(const RegistryHeadings& headings, std::string top);

  const std::string& Top() const { return TopPath; }

  // The key of that path below HKEY_LOCAL_MACHINE, or null.
  Key* Find(std::string_view path);

 private:
  void Add(const RegistryHeading& heading);
  void Remove(std::string_view path);

  std::string TopPath;
  std::vector<Key> Keys;  // the first is HKEY_LOCAL_MACHINE itself
};

// Whether a path is the other one or lies below it.
bool IsAtOrBelow(std::string_view path, std::string_view top);
