#pragma once

#include <string>
#include <vector>

#include "reader/change.h"

// "added section path/name|field before > after", with "-" for nothing.
inline std::string ChangeText(const Change& change) {
  std::string text(ChangeName(change.Kind));
  text += ' ' + std::string(SectionName(change.Where)) + ' ';
  for (const std::string& part : change.Path) {
    text += part + '/';
  }
  text += change.Name;
  for (const FieldChange& field : change.Fields) {
    text += '|' + std::string(field.Name) + ' ' + field.Before.value_or("-") + " > " +
            field.After.value_or("-");
  }
  return text;
}

inline std::vector<std::string> ChangeTexts(const Changes& changes) {
  std::vector<std::string> texts;
  for (const Change& change : changes.List) {
    texts.push_back(ChangeText(change));
  }
  return texts;
}
