#pragma once

#include <list>
#include <optional>
#include <string>
#include <vector>

#include "platform/posix/registry/branch.h"
#include "platform/posix/registry/values.h"

// The functions of platform/registry.h over the bytes of a registry export. A query for a key
// outside the branches read so far reads the export once and keeps one branch: that of the key's
// parent, but never an entire hive. A query for values reads the lines of that key.
class RegistryExport {
 public:
  explicit RegistryExport(ByteReader read);

  RegistryData Read(const std::string& keyPath, const std::string& valueName, size_t limit);
  std::vector<std::string> ValueNames(const std::string& keyPath);
  std::vector<std::string> SubKeyNames(const std::string& keyPath);

 private:
  const RegistryBranch& BranchOf(std::string_view path);
  const RegistryValues& ValuesOf(std::string_view path);

  ByteReader ReadBytes;
  ExportFormat Format;
  std::list<RegistryBranch> Branches;
  std::optional<std::string> CurrentKey;  // the last one whose values were read
  RegistryValues CurrentValues;
};
