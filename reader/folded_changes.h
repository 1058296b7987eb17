#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "reader/change.h"

// The changes of an event as a person reads them. All texts are UTF-8, not yet made printable.

struct ChangeLine {
  ChangeKind Kind = ChangeKind::kChanged;
  std::string Name;
  std::string Value;  // "4096 -> 8192"; may be empty
};

struct ChangeGroup {
  std::string Title;  // "services", "copy Prod, global profile"
  std::vector<ChangeLine> Lines;
};

// Groups by section, copy and instance; the processes come last. Unless all is to be shown, a copy,
// instance or driver that came or went is one line with the counts of what is in it, and the
// system's own processes are counted in one line.
std::vector<ChangeGroup> GroupChanges(const std::vector<Change>& changes, bool showsAll);

// The sections as the summary of the changes names them.
struct Category {
  std::string_view Name;
  bool IsCompared = true;  // all of its sections were compared
  bool HasChanges = false;
};

// All of them, in the order of the sections.
std::vector<Category> CategoriesOf(const Changes& changes);
