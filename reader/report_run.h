#pragma once

#include <cstddef>
#include <span>
#include <string_view>

#include "reader/report.h"
#include "reader/report_marks.h"

using Marks = std::span<const Mark>;

// Reads one run of a report. The run is the text from the offset "begin" to its end. The marks are
// those of the run, from its start block on if it has one.
ReportRun ReadRun(std::string_view text, size_t begin, Marks marks, const ReportFacts& facts);
