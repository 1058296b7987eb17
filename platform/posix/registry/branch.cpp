#include "platform/posix/registry/branch.h"

#include <algorithm>
#include <utility>

RegistryBranch::RegistryBranch(std::string top, const ByteReader& read, const ExportFormat& format)
    : Top(std::move(top)) {
  Section* open = nullptr;
  const auto endSection = [&open](uint32_t end) {
    if (open != nullptr) {
      open->End = end;
    }
  };
  endSection(VisitHeadings(read, format, [&](const RegistryHeading& heading) {
    endSection(heading.Begin);
    open = Take(heading);
  }));
}

// Returns the section that the heading begins; null for one that is no key of the branch.
RegistryBranch::Section* RegistryBranch::Take(const RegistryHeading& heading) {
  const std::string_view path = heading.Path;
  if (heading.Kind == HeadingKind::kRemoval && IsAtOrBelow(Top, path)) {
    Sections.clear();
  }
  if (heading.Kind == HeadingKind::kOther || !Covers(path) || !IsKeyPath(path)) {
    return nullptr;
  }
  if (heading.Kind == HeadingKind::kRemoval) {
    const auto first = Sections.lower_bound(BelowTop(path));
    const auto isBelow = [&](const auto& entry) {
      return IsAtOrBelow(entry.first, BelowTop(path));
    };
    Sections.erase(first, std::find_if_not(first, Sections.end(), isBelow));
    return nullptr;
  }
  // Most exports are in the order of the tree.
  const Section section{heading.Begin, heading.Begin};
  return &Sections.emplace_hint(Sections.end(), BelowTop(path), section)->second;
}

std::string_view RegistryBranch::BelowTop(std::string_view path) const {
  path.remove_prefix(Top.size());
  return path.substr(path.starts_with('\\') ? 1 : 0);
}

std::vector<RegistryBranch::Section> RegistryBranch::SectionsOf(std::string_view path) const {
  std::vector<Section> sections;
  const auto [first, last] = Sections.equal_range(BelowTop(path));
  for (auto entry = first; entry != last; ++entry) {
    sections.push_back(entry->second);
  }
  return sections;
}

std::vector<std::string> RegistryBranch::SubKeyNames(std::string_view path) const {
  const std::string_view parent = BelowTop(path);
  std::vector<std::pair<uint32_t, std::string_view>> firsts;  // of each subkey its first heading
  for (auto entry = Sections.upper_bound(parent);
       entry != Sections.end() && IsAtOrBelow(entry->first, parent); ++entry) {
    const auto below =
        std::string_view(entry->first).substr(parent.empty() ? 0 : parent.size() + 1);
    const std::pair heading(entry->second.Begin, FirstName(below));
    if (firsts.empty() || !EqualsIgnoringCase(firsts.back().second, heading.second)) {
      firsts.push_back(heading);
    }
    firsts.back() = std::min(firsts.back(), heading);
  }
  std::sort(firsts.begin(), firsts.end());
  std::vector<std::string> names;
  names.reserve(firsts.size());
  for (const auto& [begin, name] : firsts) {
    names.emplace_back(name);
  }
  return names;
}
