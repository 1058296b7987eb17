#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

// What is wrong or missing in a history. All texts are UTF-8.

enum class FindingLevel { kError, kWarning, kNote };

// "error", "warning" or "note".
std::string_view LevelName(FindingLevel level);

struct Finding {
  FindingLevel Level = FindingLevel::kError;
  std::string Code;   // "damaged", "file-missing" and so on
  std::string Event;  // the identity; empty for the history as a whole
  std::string Text;
};

// Findings in the order in which they were added, within the limits of reader/limits.h: a longer
// text is cut, and after kMostBytesOfFindings one finding says that the others are left out.
class FindingList {
 public:
  void Add(Finding finding);

  bool empty() const { return List.empty(); }
  std::vector<Finding>::const_iterator begin() const { return List.begin(); }
  std::vector<Finding>::const_iterator end() const { return List.end(); }

 private:
  std::vector<Finding> List;
  size_t Bytes = 0;
};
