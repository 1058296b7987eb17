#pragma once

#include <array>
#include <cstddef>
#include <optional>
#include <string_view>
#include <vector>

#include "reader/item.h"

// A snapshot has six parts, each below a numbered heading: users, software, processes, services,
// products, drivers.
inline constexpr size_t kSnapshotParts = 6;

// The text of each part, between its heading and the next; nothing for a part that is missing or
// not whole. The texts are views into the report, whose lines end with a line feed alone.
struct Snapshot {
  std::array<std::optional<std::string_view>, kSnapshotParts> Parts;
};

// The rows of a run are padded on the left until the first row of members, software or services
// was written, and on the right from then on.
enum class Padding { kLeft, kRight };

// The padding at the start of a part, by the rows of the parts before it.
Padding PaddingOfPart(const Snapshot& snapshot, size_t part);

// The part that has the items of a section.
size_t PartOf(Section section);

// The items of a part in the order of the report, each process on its own. Nothing if the text is
// not built as the recorder writes it or has more than kMostRows (reader/limits.h).
std::optional<std::vector<Item>> ReadItems(std::string_view text, size_t part, Padding padding);

// How many bytes at the start of the text are the lines of a part that breaks off there: up to the
// first line that it cannot have.
size_t TableLength(std::string_view text, size_t part);
