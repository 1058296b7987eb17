#pragma once

#include <array>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "reader/item.h"
#include "reader/snapshot.h"
#include "reader/text_encoding.h"

enum class ChangeKind { kAdded, kRemoved, kChanged };

// "added", "removed" or "changed".
std::string_view ChangeName(ChangeKind kind);

// All texts are UTF-8.
struct FieldChange {
  std::string_view Name;
  std::optional<std::string> Before;  // nothing for an item that was added
  std::optional<std::string> After;   // nothing for one that was removed
};

struct Change {
  ChangeKind Kind = ChangeKind::kAdded;
  Section Where = Section::kUser;
  std::vector<std::string> Path;
  std::string Name;
  std::vector<FieldChange> Fields;  // of a changed item those that differ, in the order of the item
};

struct ChangeCounts {
  size_t Added = 0;
  size_t Removed = 0;
  size_t Changed = 0;
};

// What differs between two snapshots.
struct Changes {
  std::vector<Change> List;  // by section, then in the order of the report: before, then after
  size_t Bytes = 0;          // of memory that the list takes
  ChangeCounts Counts;       // of all changes, also of those that are not in the list
  std::array<bool, kSectionCount> Compared = {};  // false where a snapshot is not whole
  std::array<bool, kSectionCount> Differs = {};   // true for a section with a change
};

enum class ChangeDetail { kCounts, kList };

// Compares the parts that are whole in both snapshots. Processes are compared by the number of each
// name. If several items have one identity, those that are equal in all fields belong together
// first, and the others in the order of the report. The list stays empty with kCounts, and ends
// after kMostBytesOfEvent (reader/limits.h).
Changes CompareSnapshots(const Snapshot& before, const Snapshot& after, const TextDecoder& decoder,
                         ChangeDetail detail);
