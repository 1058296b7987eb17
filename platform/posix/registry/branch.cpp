#include "platform/posix/registry/branch.h"

#include <algorithm>
#include <utility>

RegistryBranch::RegistryBranch(std::string top, const ByteReader& read, const ExportFormat& format)
    : Top(std::move(top)) {
  Section unused;
  Section* open = &unused;
  const uint32_t end = VisitHeadings(read, format, [&](const RegistryHeading& heading) {
    open->End = heading.Begin;
    open = Take(heading) ? &Entries.back().Lines : &unused;
  });
  open->End = end;
  // Of one path the last heading comes first, as ApplyRemovals needs it.
  const auto isBefore = [this](const Entry& a, const Entry& b) {
    const bool isAfter = TreeOrder()(PathOf(b), PathOf(a));
    return TreeOrder()(PathOf(a), PathOf(b)) || (!isAfter && a.Lines.Begin > b.Lines.Begin);
  };
  if (!std::is_sorted(Entries.begin(), Entries.end(), isBefore)) {  // most exports are
    std::sort(Entries.begin(), Entries.end(), isBefore);
  }
  ApplyRemovals();
}

bool RegistryBranch::Take(const RegistryHeading& heading) {
  const bool isRemoval = heading.Kind == HeadingKind::kRemoval;
  const bool isAbove = isRemoval && IsAtOrBelow(Top, heading.Path);
  if (heading.Kind == HeadingKind::kOther || (!isAbove && !Covers(heading.Path)) ||
      !IsKeyPath(heading.Path)) {
    return false;
  }
  const std::string_view path = isAbove ? "" : BelowTop(heading.Path);
  Entries.push_back({static_cast<uint32_t>(Paths.size()),
                     static_cast<uint32_t>(path.size()),
                     {heading.Begin, heading.Begin},
                     isRemoval});
  Paths += path;
  return true;
}

// Drops the removals, and the headings that a later removal of their key or of one above cancels.
void RegistryBranch::ApplyRemovals() {
  struct Removal {
    std::string_view Path;
    uint32_t Begin;  // of the last one of this path and of those above it
  };
  std::vector<Removal> removals;  // of the paths at and above the entry
  std::erase_if(Entries, [&](const Entry& entry) {
    while (!removals.empty() && !IsAtOrBelow(PathOf(entry), removals.back().Path)) {
      removals.pop_back();
    }
    const uint32_t last = removals.empty() ? 0 : removals.back().Begin;
    if (entry.IsRemoval) {
      removals.push_back({PathOf(entry), std::max(last, entry.Lines.Begin)});
    }
    return entry.IsRemoval || entry.Lines.Begin < last;
  });
}

std::string_view RegistryBranch::PathOf(const Entry& entry) const {
  return std::string_view(Paths).substr(entry.PathBegin, entry.PathSize);
}

std::string_view RegistryBranch::BelowTop(std::string_view path) const {
  path.remove_prefix(Top.size());
  return path.substr(path.starts_with('\\') ? 1 : 0);
}

std::vector<RegistryBranch::Entry>::const_iterator RegistryBranch::FirstAtOrBelow(
    std::string_view path) const {
  if (!IsKeyPath(path)) {
    return Entries.end();
  }
  return std::lower_bound(
      Entries.begin(), Entries.end(), BelowTop(path),
      [this](const Entry& entry, std::string_view p) { return TreeOrder()(PathOf(entry), p); });
}

std::vector<RegistryBranch::Section> RegistryBranch::SectionsOf(std::string_view path) const {
  const std::string_view wanted = BelowTop(path);
  std::vector<Section> sections;
  for (auto entry = FirstAtOrBelow(path);
       entry != Entries.end() && EqualsIgnoringCase(PathOf(*entry), wanted); ++entry) {
    sections.push_back(entry->Lines);
  }
  std::reverse(sections.begin(), sections.end());
  return sections;
}

std::vector<std::string> RegistryBranch::SubKeyNames(std::string_view path) const {
  const std::string_view parent = BelowTop(path);
  std::vector<std::pair<uint32_t, std::string_view>> firsts;  // of each subkey its first heading
  for (auto entry = FirstAtOrBelow(path);
       entry != Entries.end() && IsAtOrBelow(PathOf(*entry), parent); ++entry) {
    std::string_view rest = PathOf(*entry).substr(parent.size());
    rest.remove_prefix(rest.starts_with('\\') ? 1 : 0);
    const std::pair heading(entry->Lines.Begin, FirstName(rest));
    if (firsts.empty() || !EqualsIgnoringCase(firsts.back().second, heading.second)) {
      firsts.push_back(heading);
    }
    firsts.back() = std::min(firsts.back(), heading);
  }
  std::sort(firsts.begin(), firsts.end());
  std::vector<std::string> names;
  for (const auto& [begin, name] : firsts) {
    if (!name.empty()) {  // the key itself
      names.emplace_back(name);
    }
  }
  return names;
}
