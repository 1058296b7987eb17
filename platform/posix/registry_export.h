#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/posix/registry_headings.h"
#include "platform/posix/registry_map.h"
#include "platform/posix/registry_pieces.h"
#include "platform/posix/registry_tree.h"
#include "platform/registry.h"

// Answers the questions of platform/registry.h from the text of a registry export, whatever state
// that text is in.
//
// The idea: an export is many megabytes, of which a run wants a few kilobytes, so nothing is kept
// but the way to them. The first question sends the whole text by once and notes which stretch of
// it tells of which part of the registry (MapRegistry). A question about a part that nobody has
// asked for goes through the stretches of that part again and makes a tree of its keys
// (RegistryTree). A question about a key reads the few lines below its headings, and keeps the
// values that they say (ReadValueLines).
class RegistryExport {
 public:
  explicit RegistryExport(ByteReader read);

  RegistryData Read(const std::string& keyPath, const std::string& valueName, size_t limit);
  std::vector<std::string> ValueNames(const std::string& keyPath);
  std::vector<std::string> SubKeyNames(const std::string& keyPath);

 private:
  RegistryTree& BranchOf(const std::string& keyPath);
  std::string TopFor(const std::string& keyPath) const;
  RegistryValues* ValuesOf(const std::string& keyPath);
  void ReadLines(const RegistryTree::Lines& lines, RegistryValues& values) const;

  ByteReader ReadBytes;
  ExportFormat Format;
  std::optional<RegistryHeadings> Headings;  // since the first question
  std::vector<RegistryStretch> Map;
  std::vector<std::unique_ptr<RegistryTree>> Branches;
};
