#pragma once

#include "reader/finding.h"
#include "reader/history.h"

// What is wrong or missing in a history, in the order of its events. It does not include
// Source::Findings.
FindingList CheckHistory(const History& history);
