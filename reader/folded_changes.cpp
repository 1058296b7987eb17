#include "reader/folded_changes.h"

#include <algorithm>
#include <array>
#include <map>
#include <set>
#include <tuple>

#include "reader/event_text.h"
#include "reader/system_processes.h"

namespace {

// Copies, instances and drivers contain the items whose paths begin with their own path and name.
bool IsHolder(Section section) {
  return section == Section::kCopies || section == Section::kInstances ||
         section == Section::kDrivers;
}

bool IsOfDrivers(Section section) {
  return section == Section::kDrivers || section == Section::kDriverParameters;
}

bool IsOfCopies(Section section) {
  return section == Section::kCopies || section == Section::kProducts ||
         section == Section::kProfile || section == Section::kInstances ||
         section == Section::kInstanceProfile;
}

// Identifies a copy, an instance or a driver that came or went.
using Holder = std::tuple<ChangeKind, bool, std::vector<std::string>>;

Holder HolderOf(const Change& change) {
  std::vector<std::string> path = change.Path;
  path.push_back(change.Name);
  return {change.Kind, IsOfDrivers(change.Where), path};
}

// The outermost of the holders that contain the item of a change; end() if none does.
std::set<Holder>::const_iterator OutermostHolder(const std::set<Holder>& holders,
                                                 const Change& change) {
  if (!IsOfDrivers(change.Where) && !IsOfCopies(change.Where)) {
    return holders.end();
  }
  std::vector<std::string> path;
  for (const std::string& part : change.Path) {
    path.push_back(part);
    const auto found = holders.find({change.Kind, IsOfDrivers(change.Where), path});
    if (found != holders.end()) {
      return found;
    }
  }
  return holders.end();
}

std::set<Holder> HoldersIn(const std::vector<Change>& changes) {
  std::set<Holder> holders;
  for (const Change& change : changes) {
    if (IsHolder(change.Where) && change.Kind != ChangeKind::kChanged) {
      holders.insert(HolderOf(change));
    }
  }
  return holders;
}

struct Contents {
  size_t Products = 0;
  size_t Instances = 0;
  size_t Values = 0;

  void Count(Section section) {
    (section == Section::kProducts    ? Products
     : section == Section::kInstances ? Instances
                                      : Values)++;
  }

  std::string Text() const {
    std::string text;
    for (const auto& [count, name] :
         {std::pair{Products, "product"}, {Instances, "instance"}, {Values, "value"}}) {
      if (count > 0) {
        text += (text.empty() ? "" : ", ") + std::to_string(count) + " " + name +
                (count == 1 ? "" : "s");
      }
    }
    return text;
  }
};

std::map<Holder, Contents> CountContents(const std::set<Holder>& holders,
                                         const std::vector<Change>& changes) {
  std::map<Holder, Contents> contents;
  for (const Change& change : changes) {
    if (const auto holder = OutermostHolder(holders, change); holder != holders.end()) {
      contents[*holder].Count(change.Where);
    }
  }
  return contents;
}

std::string TitleOf(const Change& change) {
  const auto part = [&change](size_t i) {
    return i < change.Path.size() ? change.Path[i] : std::string();
  };
  const bool isGlobal = part(0) == "global";
  switch (change.Where) {
    case Section::kGroups:
      return isGlobal ? "global groups" : "groups";
    case Section::kMembers:
      return change.Path.size() > 1 ? "members of global group " + part(1)
                                    : "members of " + part(0);
    case Section::kProducts:
      return "copy " + part(0) + ", products";
    case Section::kProfile:
      return "copy " + part(0) + ", global profile";
    case Section::kInstances:
      return "copy " + part(0) + ", instances";
    case Section::kInstanceProfile:
      return "copy " + part(0) + ", instance " + part(1);
    case Section::kDriverParameters:
      return "driver " + part(0);
    default:
      return std::string(SectionName(change.Where));
  }
}

// The groups are printed in the order of these: what belongs to a copy stays together, and the
// processes, which change most and say least, come last.
std::tuple<int, std::string, Section, std::string> OrderOf(const Change& change) {
  const bool isInCopy = IsOfCopies(change.Where) && change.Where != Section::kCopies;
  const int rank = change.Where == Section::kProcesses ? 3
                   : IsOfDrivers(change.Where)         ? 2
                   : isInCopy                          ? 1
                                                       : 0;
  return {rank, isInCopy ? change.Path.front() : "", change.Where,
          change.Path.size() > 1 ? change.Path[1] : ""};
}

ChangeLine LineOf(const Change& change) {
  const bool hasPublisher =
      change.Where == Section::kSoftware && !change.Path.empty() && !change.Path.front().empty();
  return {change.Kind, hasPublisher ? change.Name + " (" + change.Path.front() + ")" : change.Name,
          TextOfFields(change)};
}

class Grouping {
 public:
  void Add(const Change& change, ChangeLine line) {
    std::string title = TitleOf(change);
    if (Groups.empty() || Groups.back().Title != title) {
      Groups.push_back({std::move(title), {}});
    }
    Groups.back().Lines.push_back(std::move(line));
  }

  std::vector<ChangeGroup> Groups;
};

std::vector<const Change*> InOrder(const std::vector<Change>& changes) {
  std::vector<const Change*> ordered;
  ordered.reserve(changes.size());
  for (const Change& change : changes) {
    ordered.push_back(&change);
  }
  std::stable_sort(ordered.begin(), ordered.end(),
                   [](const Change* a, const Change* b) { return OrderOf(*a) < OrderOf(*b); });
  return ordered;
}

ChangeLine LineOfOthers(size_t count) {
  return {ChangeKind::kChanged,
          std::to_string(count) +
              (count == 1 ? " other name (--all shows it)" : " other names (--all shows them)"),
          ""};
}

}  // namespace

std::vector<ChangeGroup> GroupChanges(const std::vector<Change>& changes, bool showsAll) {
  const std::set<Holder> holders = showsAll ? std::set<Holder>() : HoldersIn(changes);
  const std::map<Holder, Contents> contents = CountContents(holders, changes);
  Grouping grouping;
  const Change* folded = nullptr;
  size_t foldedProcesses = 0;
  for (const Change* change : InOrder(changes)) {
    if (OutermostHolder(holders, *change) != holders.end()) {
      continue;
    }
    if (change->Where == Section::kProcesses && !showsAll && IsSystemProcess(change->Name)) {
      folded = change;
      ++foldedProcesses;
      continue;
    }
    ChangeLine line = LineOf(*change);
    if (const auto found = contents.find(HolderOf(*change)); found != contents.end()) {
      line.Value = found->second.Text();
    }
    grouping.Add(*change, std::move(line));
  }
  if (folded != nullptr) {
    grouping.Add(*folded, LineOfOthers(foldedProcesses));
  }
  return grouping.Groups;
}

// A copy's values and instances count as the copy, a driver's parameters as the driver.
static Section CategoryOf(Section section) {
  return section == Section::kProducts ? section
         : IsOfCopies(section)         ? Section::kCopies
         : IsOfDrivers(section)        ? Section::kDrivers
                                       : section;
}

std::vector<Category> CategoriesOf(const Changes& changes) {
  std::array<Category, kSectionCount> all = {};
  for (size_t i = 0; i < kSectionCount; ++i) {
    Category& category = all[static_cast<size_t>(CategoryOf(static_cast<Section>(i)))];
    category.IsCompared = category.IsCompared && changes.Compared[i];
    category.HasChanges = category.HasChanges || changes.Differs[i];
  }
  std::vector<Category> categories;
  for (size_t i = 0; i < kSectionCount; ++i) {
    if (CategoryOf(static_cast<Section>(i)) == static_cast<Section>(i)) {
      all[i].Name = SectionName(static_cast<Section>(i));
      categories.push_back(all[i]);
    }
  }
  return categories;
}
