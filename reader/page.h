#pragma once

#include <string>
#include <vector>

#include "reader/finding.h"
#include "reader/history.h"

// The whole history, read with Detail::kAll, as one HTML page in UTF-8: a time line and a table of
// the events, the findings of a check, and for each event its facts, changes, messages and files,
// folded. The page has no script, refers to nothing outside itself, and forbids the browser both.
std::string RenderPage(const History& history, const std::vector<Finding>& findings);
