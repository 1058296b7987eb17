#pragma once

#include <string_view>
#include <vector>

#include "reader/finding.h"
#include "reader/history.h"

// What is wrong or missing in a history that was read with Detail::kCounts or more, in the order of
// its events. What the source itself found (Source::Findings) is not in it.
std::vector<Finding> CheckHistory(const History& history);

// "error", "warning" or "note".
std::string_view LevelName(FindingLevel level);
