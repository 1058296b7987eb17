#pragma once

#include <string>

// What is wrong or missing in a history. All texts are UTF-8.

enum class FindingLevel { kError, kWarning, kNote };

struct Finding {
  FindingLevel Level = FindingLevel::kError;
  std::string Code;   // "damaged", "file-missing" and so on
  std::string Event;  // the identity; empty for the history as a whole
  std::string Text;
};
