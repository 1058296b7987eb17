#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "platform/posix/registry_headings.h"
#include "platform/posix/registry_pieces.h"
#include "platform/posix/registry_tree.h"
#include "platform/registry.h"

// Answers the questions of platform/registry.h from the text of a registry export, whatever state
// that text is in.
//
// The idea: an export is many megabytes of which a run wants a few kilobytes. So the first question
// sends the whole text by once and keeps only its headings (RegistryHeadings). A question about a
// part of the registry that nobody has asked for picks the headings of that branch out of them and
// makes them a tree (RegistryTree). A question about a key reads the few lines below the headings
// of that key again, and keeps the values that they say (ReadValueLines). Each costs what it looks
// at: the text once, the headings once for every branch, the lines once for every key.
class RegistryExport {
 public:
  explicit RegistryExport(ByteReader read);

  RegistryData Read(const std::string& keyPath, const std::string& valueName, size_t limit);
  std::vector<std::string> ValueNames(const std::string& keyPath);
  std::vector<std::string> SubKeyNames(const std::string& keyPath);

 private:
  RegistryTree& BranchOf(const std::string& keyPath);
  RegistryValues* ValuesOf(const std::string& keyPath);
  void ReadLines(const RegistryHeading& heading, RegistryValues& values) const;

  ByteReader ReadBytes;
  std::unique_ptr<RegistryHeadings> Headings;  // made by the first question
  std::vector<std::unique_ptr<RegistryTree>> Branches;
};
