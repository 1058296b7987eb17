#pragma once

#include <cstddef>
#include <optional>
#include <string_view>

#include "reader/lines.h"
#include "reader/report.h"

// The blocks of a report around its snapshots. The readers of the first two skip the lines that
// they have read, also where a block breaks off.

// Nothing if the block breaks off or is none.
std::optional<StartBlock> ReadStart(LineReader& lines);

// The name of the computer. Nothing if the block breaks off or is none.
std::optional<std::string_view> ReadComputer(LineReader& lines);

enum class EndStatus {
  kWhole,
  kBreaksOff,   // the text ends first
  kContradicts  // another text is there
};

struct EndBlocks {
  EndStatus Status = EndStatus::kWhole;
  ResultBlock Result;  // a value that was not reached has null data
  size_t End = 0;      // offset after them
};

// Reads the result block and the end block that begin at the offset.
EndBlocks ReadEnd(std::string_view text, size_t offset);
