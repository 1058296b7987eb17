#pragma once

#include <ostream>

#include "reader/finding.h"
#include "reader/history.h"

// Writes a history that was read with Detail::kAll as one HTML page in UTF-8: a time line and a
// table of the events, the findings of a check, and for each event its facts, changes, messages and
// files, folded. The page has no script, refers to nothing outside itself, and forbids the browser
// both. A text of more than kMostBytesOfPageText (reader/limits.h) is cut. A failure shows in the
// stream.
void WritePage(const History& history, const FindingList& findings, std::ostream& out);
