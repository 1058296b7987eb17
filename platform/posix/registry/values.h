#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "platform/posix/registry/export_text.h"
#include "platform/posix/registry/names.h"
#include "platform/registry.h"

// The values of one key.
class RegistryValues {
 public:
  // Parses the lines below one of the key's headings, in UTF-8. An existing value is replaced or,
  // by "name"=-, removed. A line that cannot be parsed is skipped. One that begins with a bracket
  // is a damaged heading, and ends the parsing.
  void AddLines(std::string_view lines, const ExportFormat& format);

  // In the order in which they were first written, and spelled so.
  std::vector<std::string> Names() const;

  // The data of a value; null if there is none of that name.
  const RegistryData* Find(std::string_view name) const;

 private:
  struct Value {
    size_t Number = 0;
    RegistryData Data;
  };

  std::map<std::string, Value, TreeOrder> Values;
  size_t LastNumber = 0;
};
