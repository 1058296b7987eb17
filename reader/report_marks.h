#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

// The lines of a report that may begin or end a block. Whether they do depends on their order and
// on what is in them (reader/report.h).

inline constexpr std::string_view kStartTitle =
    "---------- ORX Installation History Logger ( Start )----------";
inline constexpr std::string_view kEndTitle =
    "---------- ORX Installation History Logger ( End ) ----------";

enum class MarkKind {
  kStart,      // the title of a start block
  kHeading,    // of a part of a snapshot, with an empty line before it
  kBeforeBox,  // the box at the start of the first snapshot
  kBeforeEnd,  // the box at its end
  kAfterBox,   // the same of the second snapshot
  kAfterEnd,
};

struct Mark {
  MarkKind Kind = MarkKind::kStart;
  size_t Begin = 0;       // offset of the first line
  size_t End = 0;         // offset after the last line
  size_t Part = 0;        // of a heading: the part that it begins
  std::string_view Text;  // of a box: the text from the identity on
};

// In the order of the text, at most kMostMarks (reader/limits.h). Takes time in proportion to the
// length of the text.
std::vector<Mark> FindMarks(std::string_view text);

// What a box of the second snapshot begins with, up to the identity.
std::string HeadOfAfterBox();

// What the first snapshot has before a part: an empty line and the heading, or after the last part
// what the box at the end begins with.
std::string HeadOfPart(size_t part);
