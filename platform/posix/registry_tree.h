#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/posix/registry_headings.h"
#include "platform/posix/registry_lines.h"
#include "platform/posix/registry_map.h"
#include "platform/posix/registry_names.h"

// The keys of one branch of the registry. They lie side by side and name each other by number, so
// that no depth of the tree is a depth of calls.
class RegistryTree {
 public:
  // Lines of the file that say values of a key, its heading in front of them.
  struct Lines {
    uint64_t Begin = 0;
    uint64_t End = 0;
  };

  struct Key {
    RegistryNames<size_t> SubKeys;  // their numbers
    std::vector<Lines> Places;
    std::unique_ptr<RegistryValues> Values;  // what the lines say, once somebody has asked
  };

  // Reads the headings of the stretches that may tell of the branch.
  RegistryTree(RegistryHeadings& headings, const std::vector<RegistryStretch>& map,
               std::string top);

  const std::string& Top() const { return TopPath; }

  // The key of that path at or below the top, or null.
  Key* Find(std::string_view path);

 private:
  void Take(const RegistryHeading& heading);
  void EndLines(uint64_t end);
  void Remove(std::string_view path);
  size_t FindOrAdd(std::string_view path);
  std::string_view BelowTop(std::string_view path) const;

  std::string TopPath;
  std::vector<Key> Keys;  // the first is the top
  Lines* OpenLines = nullptr;
};
