#pragma once

#include <string_view>
#include <vector>

#include "reader/finding.h"
#include "reader/history.h"

// What is wrong or missing in a history that was read with Detail::kCounts or more, in the order of
// its events. It does not include Source::Findings.
std::vector<Finding> CheckHistory(const History& history);

// "error", "warning" or "note".
std::string_view LevelName(FindingLevel level);
