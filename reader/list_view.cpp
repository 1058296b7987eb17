#include <algorithm>
#include <array>
#include <string_view>

#include "reader/event_text.h"
#include "reader/limits.h"
#include "reader/views.h"

namespace {

enum Column { kStarted, kDuration, kState, kAction, kProduct, kCopy, kChanges, kEvent, kColumns };

using Row = std::array<std::string, kColumns>;

const Row kTitles = {"STARTED", "DURATION", "STATE",   "ACTION",
                     "PRODUCT", "COPY",     "CHANGES", "EVENT"};

bool IsCompared(const Event& event) {
  const auto& compared = event.Differences.Compared;
  return std::find(compared.begin(), compared.end(), true) != compared.end();
}

// "+2 -1 ~4" for items added, removed and changed; "-" for an event that has only one snapshot.
std::string TextOfCounts(const Event& event) {
  if (!IsCompared(event)) {
    return "-";
  }
  const ChangeCounts& counts = event.Differences.Counts;
  std::string text;
  const auto add = [&](char sign, size_t count) {
    if (count > 0) {
      text += (text.empty() ? "" : " ") + (sign + std::to_string(count));
    }
  };
  add('+', counts.Added);
  add('-', counts.Removed);
  add('~', counts.Changed);
  return text.empty() ? "none" : text;
}

Row RowOf(const Event& event) {
  Row row = {event.Started ? TextOfTime(*event.Started) : "-",
             DurationOf(event),
             std::string(StateName(event.State)),
             event.Action,
             event.Product,
             event.Copy.empty() || event.Copy == "(Unknown)" ? "-" : event.Copy,
             TextOfCounts(event),
             event.Identity};
  for (std::string& cell : row) {
    cell = Printable(cell);
  }
  return row;
}

Colour ColourOf(EventState state) {
  switch (state) {
    case EventState::kOk:
      return Colour::kGreen;
    case EventState::kFailed:
      return Colour::kRed;
    case EventState::kOpen:
      return Colour::kYellow;
    case EventState::kNoStart:
      return Colour::kMagenta;
    case EventState::kEnded:
      break;
  }
  return Colour::kPlain;
}

using Widths = std::array<size_t, kColumns>;

size_t SumOf(const Widths& widths) {
  size_t sum = 0;
  for (const size_t width : widths) {
    sum += width + 2;
  }
  return sum - 2;
}

// Takes from the widest of the columns with free text until the line fits.
void FitInto(size_t width, Widths& widths) {
  constexpr size_t least = 8;
  while (SumOf(widths) > width) {
    size_t& widest = *std::max_element(
        widths.begin(), widths.end(), [&widths](const size_t& a, const size_t& b) {
          const auto spare = [&widths](const size_t& columns) -> size_t {
            const auto column = &columns - widths.data();
            const bool isFree =
                column == kAction || column == kProduct || column == kCopy || column == kEvent;
            return isFree ? columns : 0;
          };
          return spare(a) < spare(b);
        });
    if (widest <= least) {
      return;
    }
    --widest;
  }
}

std::string LineOf(const Row& row, const Widths& widths, Colour stateColour,
                   const ViewOptions& options) {
  std::string line;
  for (size_t i = 0; i < kColumns; ++i) {
    const std::string cell = options.Width ? CutTo(row[i], widths[i]) : row[i];
    const size_t used = ColumnsOf(cell);
    line += Painted(cell, i == kState ? stateColour : Colour::kPlain, options);
    if (i + 1 < kColumns) {
      line.append(2 + (used < widths[i] ? widths[i] - used : 0), ' ');
    }
  }
  return line + "\n";
}

std::string TotalsOf(const std::vector<const Event*>& events) {
  const auto count = [&](EventState state) {
    return std::to_string(std::count_if(events.begin(), events.end(), [state](const Event* event) {
      return event->State == state;
    }));
  };
  return std::to_string(events.size()) + (events.size() == 1 ? " run, " : " runs, ") +
         count(EventState::kFailed) + " failed, " + count(EventState::kOpen) + " open, " +
         count(EventState::kNoStart) + " without a start\n";
}

}  // namespace

std::string ListText(const std::vector<const Event*>& events, const ViewOptions& options) {
  std::vector<Row> rows;
  rows.reserve(events.size());
  Widths widths = {};
  const auto widen = [&widths](const Row& row) {
    for (size_t i = 0; i < kColumns; ++i) {
      widths[i] = std::max(widths[i], std::min(ColumnsOf(row[i]), kWidestColumn));
    }
  };
  widen(kTitles);
  for (const Event* event : events) {
    widen(rows.emplace_back(RowOf(*event)));
  }
  if (options.Width) {
    FitInto(*options.Width, widths);
  }
  std::string text;
  if (!events.empty()) {
    text = LineOf(kTitles, widths, Colour::kPlain, options);
  }
  for (size_t i = 0; i < rows.size(); ++i) {
    text += LineOf(rows[i], widths, ColourOf(events[i]->State), options);
  }
  return text + TotalsOf(events);
}
