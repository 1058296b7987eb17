#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "platform/posix/registry/headings.h"
#include "platform/posix/registry/names.h"

// The keys at and below one key, from one pass over an export. It takes a fixed number of bytes for
// each heading, and those of its path. A heading with a path that Windows does not allow is skipped
// with the lines below it.
class RegistryBranch {
 public:
  // The part of the export from the heading of a key to the next heading.
  struct Section {
    uint32_t Begin = 0;
    uint32_t End = 0;
  };

  RegistryBranch(std::string top, const ByteReader& read, const ExportFormat& format);

  bool Covers(std::string_view path) const { return IsAtOrBelow(path, Top); }

  // Of a key that the branch covers: its sections, and the names of its direct subkeys, in the
  // order of the export. A key exists if it or a key below it has a heading.
  std::vector<Section> SectionsOf(std::string_view path) const;
  std::vector<std::string> SubKeyNames(std::string_view path) const;

 private:
  Section* Take(const RegistryHeading& heading);
  std::string_view BelowTop(std::string_view path) const;

  std::string Top;
  std::multimap<std::string, Section, TreeOrder> Sections;  // by the path below Top
};
