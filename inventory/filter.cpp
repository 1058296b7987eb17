#include "inventory/filter.h"

#include <algorithm>

bool MatchesFilter(std::span<const std::string_view> filter, const std::string& text) {
  return filter.front() == "ALL" ||
         std::any_of(filter.begin(), filter.end(), [&text](std::string_view entry) {
           return text.find(entry) != std::string::npos;
         });
}
