#pragma once

#include <span>
#include <string>
#include <string_view>

// Whether a filter table selects a text: always if its first entry is "ALL", else if the text
// contains one of its entries, case respected. The table must have an entry.
bool MatchesFilter(std::span<const std::string_view> filter, const std::string& text);
