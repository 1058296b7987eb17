#include "reader/snapshot.h"

#include <algorithm>
#include <functional>
#include <string>

#include "reader/limits.h"
#include "reader/lines.h"
#include "reader/row.h"

namespace {

constexpr std::string_view priorToV9 = "prior to V9";

// What a row does that is no item of its table: a message that came in between.
enum class ForeignRow { kIsSkipped, kEnds };

// Reads one part of a snapshot. Each function returns false where the text is not as the recorder
// writes it.
class PartReader {
 public:
  PartReader(std::string_view text, Padding padding, ForeignRow foreign)
      : Lines(text), Adjustment(padding), Foreign(foreign) {}

  bool Read(size_t part) { return ReadPart(part) && Lines.AtEnd(); }

  // What is left at the line where reading stopped.
  std::string_view Remaining() const { return Lines.Remaining(); }

  std::vector<Item> Items;

 private:
  using RowReader = std::function<bool(std::string_view, Item&)>;

  Item NewItem(Section section, std::initializer_list<std::string_view> path = {}) const {
    Item item;
    item.Where = section;
    item.PathSize = static_cast<uint8_t>(path.size());
    std::copy(path.begin(), path.end(), item.Path.begin());
    return item;
  }

  void AddName(const Item& blank, std::string_view name) {
    Items.push_back(blank);
    Items.back().Name = name;
  }

  // The rows up to the rule, each an item that begins as the blank one. The row reader returns
  // false for a row that is no item: a message that came in between.
  bool ReadRows(std::string_view rule, const Item& blank, const RowReader& read) {
    for (LineReader ahead = Lines; const auto row = ahead.Next(); Lines = ahead) {
      Item item = blank;
      if (*row == rule) {
        Lines = ahead;
        return true;
      }
      if (read(*row, item)) {
        Items.push_back(item);
      } else if (Foreign == ForeignRow::kEnds) {
        return false;
      }
      if (Items.size() > kMostRows) {
        return false;
      }
    }
    return false;
  }

  bool ReadTable(std::string_view head, std::string_view rule, const Item& blank,
                 const RowReader& read) {
    return Lines.SkipAll({rule, head, rule}) && ReadRows(rule, blank, read);
  }

  bool ReadNames(std::string_view rule, const Item& blank) {
    return ReadRows(rule, blank, [](std::string_view row, Item& item) {
      item.Name = row;
      return true;
    });
  }

  bool ReadParameters(std::string_view head, size_t rule, const Item& blank, size_t width) {
    return ReadTable(head, Dashes(rule), blank, [this, width](std::string_view row, Item& item) {
      ReadParameterRow(row, width, Adjustment, item);
      return true;
    });
  }

  bool ReadPart(size_t part) {
    switch (part) {
      case 0:
        return ReadUsers();
      case 1:
        return ReadSoftware();
      case 2:
        return ReadProcesses();
      case 3:
        return ReadServices();
      case 4:
        return ReadProducts();
      default:
        return ReadDrivers();
    }
  }

  bool ReadUsers() {
    const std::string frame(83, '=');
    if (!Lines.Skip("")) {
      return false;
    }
    const auto user = Lines.Labelled("Logged on User:");
    if (!user) {
      return false;
    }
    if (!user->empty()) {
      AddName(NewItem(Section::kUser), *user);
    }
    if (!Lines.SkipAll({frame, ""}) ||
        !ReadGroups("Local Group List:", Dashes(35), NewItem(Section::kGroups)) ||
        !Lines.Skip("") || !ReadMembers("Local User List:", NewItem(Section::kMembers)) ||
        !Lines.Skip("")) {
      return false;
    }
    if (Lines.Skip(frame)) {
      return true;
    }
    // A domain controller.
    return ReadGroups("Global Group List:", Dashes(74), NewItem(Section::kGroups, {"global"})) &&
           ReadMembers("Global User List:", NewItem(Section::kMembers, {"global"})) &&
           Lines.Skip(frame);
  }

  bool ReadGroups(std::string_view title, std::string_view lastRule, const Item& blank) {
    const std::string_view rule = Dashes(35);
    return Lines.SkipAll({title, rule, "Group Name ", rule}) && ReadNames(lastRule, blank);
  }

  bool ReadMembers(std::string_view title, const Item& blank) {
    return Lines.Skip(title) && ReadTable("Group                                   user   ",
                                          Dashes(74), blank, [](std::string_view row, Item& item) {
                                            ReadMemberRow(row, item);
                                            return true;
                                          });
  }

  bool ReadSoftware() {
    return Lines.Skip("") &&
           ReadTable(
               "Publisher                     "
               "Product Name                                                     "
               "Version             InstallDate   Language   Location",
               Dashes(185), NewItem(Section::kSoftware), [](std::string_view row, Item& item) {
                 ReadSoftwareRow(row, item);
                 return true;
               });
  }

  bool ReadProcesses() {
    const std::string rule = std::string(Dashes(51)) + ' ';
    return Lines.Skip("") && Lines.Labelled("Processes:") &&
           Lines.SkipAll({rule, "Process ID         Process Name                     ", rule}) &&
           ReadRows("---------- Process List ( end )-------------------- ",
                    NewItem(Section::kProcesses), ReadProcessRow);
  }

  bool ReadServices() {
    const std::string rule = std::string(Dashes(68)) + ' ';
    return Lines.Skip("") &&
           ReadTable("Service Name                                                Status   ", rule,
                     NewItem(Section::kServices), ReadServiceRow);
  }

  bool SkipBox(std::string_view title) {
    const std::string stars(93, '*');
    return Lines.SkipAll({"", stars, title, stars});
  }

  bool ReadProducts() {
    if (!SkipBox("*  PART A --ORX Installed Copies Information -- Prior to V9                  "
                 "               *")) {
      return false;
    }
    if (!Lines.Skip("There is no ORX prior to V9 Installed ")) {
      AddName(NewItem(Section::kCopies), priorToV9);
      if (!Lines.Skip("") || !ReadCopy(priorToV9)) {
        return false;
      }
    }
    return SkipBox(
               "*  PART B --ORX Installed Copies Information -- V9 & Later                  "
               "                *") &&
           ReadCopiesSinceV9();
  }

  bool ReadCopiesSinceV9() {
    if (!Lines.Skip("") || !Lines.Labelled("Total ORX Copies:")) {
      return false;
    }
    if (Lines.SkipAll({"", "There is no ORX V9 & later installed "})) {
      return true;
    }
    const std::string_view rule = Dashes(45);
    const size_t first = Items.size();
    if (!Lines.SkipAll({rule, "ORX Copy Name", rule}) ||
        !ReadNames(rule, NewItem(Section::kCopies))) {
      return false;
    }
    const size_t last = Items.size();
    for (size_t i = first; i < last; ++i) {
      const std::string_view name = Items[i].Name;
      if (!Lines.Skip("") || Lines.Labelled("ORX Installation Copy Name:") != name ||
          !ReadCopy(name)) {
        return false;
      }
    }
    return true;
  }

  bool ReadCopy(std::string_view copy) {
    const std::string_view rule = Dashes(48);
    return Lines.Skip(rule) && Lines.Labelled("Total Products     :") &&
           Lines.Labelled("Total ORX Instances:") && Lines.Skip(rule) && ReadProfile(copy) &&
           ReadProductTable(copy) && ReadInstances(copy);
  }

  bool ReadProfile(std::string_view copy) {
    const std::string_view rule = Dashes(120);
    return Lines.SkipAll({"", "Global Profiles:", rule}) &&
           ReadRows(rule, NewItem(Section::kProfile, {copy}),
                    [this](std::string_view row, Item& item) {
                      ReadProfileRow(row, Adjustment, item);
                      return true;
                    });
  }

  bool ReadProductTable(std::string_view copy) {
    return Lines.SkipAll({"", "ORX Products installed:"}) &&
           ReadTable(
               "Product Name                            "
               "Product Code                            "
               "Version   Service Level       Last Modified Date",
               Dashes(128), NewItem(Section::kProducts, {copy}),
               [this](std::string_view row, Item& item) {
                 ReadProductRow(row, Adjustment, item);
                 return true;
               });
  }

  bool ReadInstances(std::string_view copy) {
    const std::string_view rule = Dashes(33);
    const size_t first = Items.size();
    if (!Lines.SkipAll({"", "ORX Instances:", rule, "Instance Name                    ", rule}) ||
        !ReadNames(rule, NewItem(Section::kInstances, {copy})) || !Lines.Skip("")) {
      return false;
    }
    const size_t last = Items.size();
    for (size_t i = first; i < last; ++i) {
      const std::string_view name = Items[i].Name;
      if (Lines.Labelled("ORX Instance Name:") != name ||
          !ReadParameters("Parameter Name                      Value                  ", 68,
                          NewItem(Section::kInstanceProfile, {copy, name}), 36) ||
          !Lines.Skip("")) {
        return false;
      }
    }
    return true;
  }

  bool ReadDrivers() {
    if (!Lines.Skip("") || !Lines.Labelled("Total ORX ODBC Drivers:")) {
      return false;
    }
    if (Lines.Skip(" ******** There is no ORX ODBC Driver Installed *********")) {
      return true;
    }
    const std::string_view rule = Dashes(43);
    if (!Lines.SkipAll({rule, "Driver Name", rule}) ||
        !ReadNames(rule, NewItem(Section::kDrivers)) || !Lines.Skip("")) {
      return false;
    }
    const size_t drivers = Items.size();
    for (size_t i = 0; i < drivers; ++i) {
      const std::string_view name = Items[i].Name;
      if (Lines.Labelled("ODBC Driver:") != name ||
          !ReadParameters("Parameter Name                Value                ", 76,
                          NewItem(Section::kDriverParameters, {name}), 30)) {
        return false;
      }
    }
    return true;
  }

  LineReader Lines;
  Padding Adjustment;
  ForeignRow Foreign;
};

bool TurnsAdjustment(const Item& item) {
  return item.Where == Section::kMembers || item.Where == Section::kSoftware ||
         item.Where == Section::kServices;
}

}  // namespace

size_t PartOf(Section section) {
  constexpr size_t parts[kSectionCount] = {0, 0, 0, 1, 2, 3, 4, 4, 4, 4, 4, 5, 5};
  return parts[static_cast<size_t>(section)];
}

std::optional<std::vector<Item>> ReadItems(std::string_view text, size_t part, Padding padding) {
  PartReader reader(text, padding, ForeignRow::kIsSkipped);
  return reader.Read(part) ? std::optional(std::move(reader.Items)) : std::nullopt;
}

Padding PaddingOfPart(const Snapshot& snapshot, size_t part) {
  for (size_t i = 0; i < part; ++i) {
    const std::optional<std::string_view>& text = snapshot.Parts[i];
    const auto items = text ? ReadItems(*text, i, Padding::kRight) : std::nullopt;
    // What cannot be read has rows.
    if (!items || std::any_of(items->begin(), items->end(), TurnsAdjustment)) {
      return Padding::kRight;
    }
  }
  return Padding::kLeft;
}

size_t TableLength(std::string_view text, size_t part) {
  PartReader reader(text, Padding::kRight, ForeignRow::kEnds);
  reader.Read(part);
  return text.size() - reader.Remaining().size();
}
