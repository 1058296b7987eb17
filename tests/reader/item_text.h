#pragma once

#include <string>

#include "reader/item.h"

// "section path/path name field=value ...", the parts separated by '|'.
inline std::string ItemText(const Item& item) {
  std::string text(SectionName(item.Where));
  for (size_t i = 0; i < item.PathSize; ++i) {
    text += (i == 0 ? '|' : '/') + std::string(item.Path[i]);
  }
  text += '|' + std::string(item.Name);
  for (size_t i = 0; i < item.FieldCount; ++i) {
    text += '|' + std::string(FieldNames(item.Where)[i]) + '=';
    text += item.Where == Section::kProcesses ? std::to_string(item.Count)
                                              : std::string(item.Values[i]);
  }
  return text;
}
