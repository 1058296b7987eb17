#include "reader/row.h"

#include <algorithm>
#include <iterator>
#include <optional>

namespace {

std::string_view TrimEnd(std::string_view text) {
  return text.substr(0, text.find_last_not_of(' ') + 1);
}

std::string_view TrimStart(std::string_view text) {
  return text.substr(std::min(text.find_first_not_of(' '), text.size()));
}

std::string_view Trim(std::string_view text, Padding padding) {
  return padding == Padding::kRight ? TrimEnd(text) : TrimStart(text);
}

bool IsNumber(std::string_view text) {
  return !text.empty() && text.find_first_not_of("0123456789") == std::string_view::npos;
}

// The column's text without its padding. Nothing if there is no padding, as the text may then be
// longer than the column; and nothing if the text has a blank at its other end, as an overlong
// column before it has then shifted it.
std::optional<std::string_view> Column(std::string_view row, size_t begin, size_t width,
                                       Padding padding) {
  if (row.size() < begin + width) {
    return std::nullopt;
  }
  const std::string_view column = row.substr(begin, width);
  const std::string_view text = Trim(column, padding);
  const bool isShifted = padding == Padding::kRight ? text.starts_with(' ') : text.ends_with(' ');
  return text.size() < width && !isShifted ? std::optional(text) : std::nullopt;
}

// The text of a last column that is longer than its field.
std::optional<std::string_view> Unpadded(std::string_view text) {
  return text.starts_with(' ') || text.ends_with(' ') ? std::nullopt : std::optional(text);
}

void SetField(Item& item, std::string_view value) { item.Values[item.FieldCount++] = value; }

}  // namespace

void ReadMemberRow(std::string_view row, Item& item) {
  constexpr std::string_view gap = "          ";
  constexpr size_t width = 30;
  item.Name = row;
  const size_t groupEnd = row.find(gap);
  if (groupEnd == std::string_view::npos) {
    return;
  }
  const size_t member = std::max(groupEnd, width) + gap.size();
  const bool isOnlyGap = member <= row.size() &&
                         TrimEnd(row.substr(0, member)).size() == groupEnd &&
                         row.find(gap, member) == std::string_view::npos;
  if (isOnlyGap && (member == row.size() || row[member] != ' ')) {
    item.Path[item.PathSize++] = row.substr(0, groupEnd);
    item.Name = row.substr(member);
  }
}

void ReadSoftwareRow(std::string_view row, Item& item) {
  constexpr size_t widths[] = {30, 65, 20, 14, 11};
  item.Name = row;
  std::string_view columns[std::size(widths)];
  size_t begin = 0;
  for (size_t i = 0; i < std::size(widths); ++i) {
    const auto column = Column(row, begin, widths[i], Padding::kRight);
    if (!column) {
      return;
    }
    columns[i] = *column;
    begin += widths[i];
  }
  const auto& [publisher, name, version, date, language] = columns;
  if (!IsNumber(language)) {
    return;
  }
  item.Path[item.PathSize++] = publisher;
  item.Name = name;
  for (const std::string_view value : {version, date, language, row.substr(begin)}) {
    SetField(item, value);
  }
}

bool ReadProcessRow(std::string_view row, Item& item) {
  constexpr size_t width = 19;
  if (row.size() < width || !IsNumber(TrimStart(TrimEnd(row.substr(0, width))))) {
    return false;
  }
  item.Name = row.substr(width);
  item.FieldCount = 1;
  return true;
}

bool ReadServiceRow(std::string_view row, Item& item) {
  constexpr std::string_view states[] = {"Stopped",
                                         "Is starting",
                                         "Is stopping",
                                         "Started",
                                         "The service continue is pending",
                                         "The service pause is pending",
                                         "Paused",
                                         "Uknown"};
  constexpr size_t width = 60;
  const auto state =
      std::find_if(std::begin(states), std::end(states), [row](std::string_view word) {
        return row.size() >= width + word.size() && row.ends_with(word);
      });
  if (state == std::end(states)) {
    return false;
  }
  const std::string_view name = row.substr(0, row.size() - state->size());
  item.Name = name.size() == width ? TrimEnd(name) : name;
  SetField(item, *state);
  return true;
}

void ReadProductRow(std::string_view row, Padding padding, Item& item) {
  constexpr size_t widths[] = {40, 40, 10, 20, 20};
  constexpr size_t rowWidth = 130;
  item.Name = row;
  if (row.size() < rowWidth) {
    return;
  }
  std::string_view columns[std::size(widths)];
  size_t begin = 0;
  for (size_t i = 0; i < std::size(widths); ++i) {
    const bool isLast = i + 1 == std::size(widths);
    const auto column =
        row.size() == rowWidth
            // No column is longer than its field.
            ? std::optional(Trim(row.substr(begin, widths[i]), padding))
            : isLast ? Unpadded(row.substr(begin)) : Column(row, begin, widths[i], padding);
    if (!column) {
      return;
    }
    columns[i] = *column;
    begin += widths[i];
  }
  if (std::count(columns[2].begin(), columns[2].end(), '.') < 2) {
    return;
  }
  item.Name = columns[0];
  std::for_each(std::begin(columns) + 1, std::end(columns),
                [&item](std::string_view value) { SetField(item, value); });
}

void ReadProfileRow(std::string_view row, Padding padding, Item& item) {
  constexpr size_t width = 30;
  item.Name = row;
  const auto column = Column(row, 0, width, padding);
  if (column && column->ends_with(':')) {
    item.Name = column->substr(0, column->size() - 1);
    SetField(item, row.substr(width));
    return;
  }
  // A name that fills the field ends at the colon, if there is but one.
  const size_t colon = row.find(':');
  if (colon != row.npos && colon + 1 >= width && row.find(':', colon + 1) == row.npos) {
    item.Name = row.substr(0, colon);
    SetField(item, row.substr(colon + 1));
  }
}

void ReadParameterRow(std::string_view row, size_t width, Padding padding, Item& item) {
  item.Name = row;
  if (const auto column = Column(row, 0, width, padding)) {
    item.Name = *column;
    SetField(item, row.substr(width));
  }
}
