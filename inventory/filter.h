#pragma once

#include <span>
#include <string>
#include <string_view>

// The rule of the filtered lists: a table that begins with "ALL" lets everything through; otherwise
// one of its entries, case respected, must stand somewhere in the text.
bool MatchesFilter(std::span<const std::string_view> filter, const std::string& text);
