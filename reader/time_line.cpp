#include "reader/time_line.h"

#include <algorithm>
#include <string_view>
#include <unordered_map>

#include "reader/html.h"
#include "reader/time_axis.h"

namespace {

// In SVG units; the picture is as wide as a page on a desk and scrolls on a phone.
constexpr int width = 960;
constexpr int plotLeft = 150;
constexpr int plotRight = width - 110;  // leaves space for the last label
constexpr int axisHeight = 26;
constexpr int rowHeight = 22;
constexpr int lanePadding = 6;
constexpr int barHeight = 18;
constexpr int leastBar = 18;  // wide enough for its mark
constexpr int letter = 7;     // width of a label's character, about

constexpr size_t mostLabels = 80;  // beyond that, labels would push the bars apart
constexpr size_t longestLabel = 14;
constexpr size_t longestLane = 18;

struct PlacedBar {
  const TimeLineBar* Bar;
  int Left;
  int Width;
  int Row;
};

struct Lane {
  std::string_view Name;
  std::vector<PlacedBar> Bars;
  std::vector<int> RowEnds;  // where each row is free again

  int Height() const { return static_cast<int>(RowEnds.size()) * rowHeight + 2 * lanePadding; }
};

struct TimeScale {
  LocalTime Begin;
  LocalTime End;

  int At(LocalTime time) const {
    const auto range = static_cast<double>(std::max<LocalTime>(End - Begin, 1));
    const double part = static_cast<double>(time - Begin) / range;
    return plotLeft + static_cast<int>(part * (plotRight - leastBar - plotLeft));
  }
};

// The first characters of UTF-8 text, with a sign that some are missing.
std::string ShortenedLabel(std::string_view text, size_t most) {
  size_t characters = 0;
  for (size_t i = 0; i < text.size(); ++i) {
    const bool isFirstByte = (static_cast<unsigned char>(text[i]) & 0xC0U) != 0x80;
    if (isFirstByte && ++characters > most) {
      return std::string(text.substr(0, i)) + "\u2026";
    }
  }
  return std::string(text);
}

int LabelWidth(const TimeLineBar& bar) {
  return static_cast<int>(std::min(bar.Label.size(), longestLabel + 1)) * letter + 8;
}

TimeScale ScaleOf(const std::vector<TimeLineBar>& bars) {
  TimeScale scale{bars.front().Begin, bars.front().End};
  for (const TimeLineBar& bar : bars) {
    scale.Begin = std::min(scale.Begin, bar.Begin);
    scale.End = std::max(scale.End, bar.End);
  }
  return scale;
}

// Adds the bar to the first row of the lane that is free at that time.
void AddToLane(Lane& lane, const TimeLineBar& bar, const TimeScale& scale, bool hasLabels) {
  const int left = scale.At(bar.Begin);
  const int barWidth = std::max(scale.At(bar.End) - left, leastBar);
  const auto isFree = [left](int rowEnd) { return rowEnd <= left; };
  auto row = std::find_if(lane.RowEnds.begin(), lane.RowEnds.end(), isFree);
  if (row == lane.RowEnds.end()) {
    row = lane.RowEnds.insert(lane.RowEnds.end(), 0);
  }
  *row = left + barWidth + (hasLabels ? LabelWidth(bar) : 2);
  lane.Bars.push_back({&bar, left, barWidth, static_cast<int>(row - lane.RowEnds.begin())});
}

std::vector<Lane> LanesOf(const std::vector<TimeLineBar>& bars, const TimeScale& scale) {
  std::vector<const TimeLineBar*> order;
  std::vector<Lane> lanes;
  std::unordered_map<std::string_view, size_t> numbers;  // of the lanes, by their names
  for (const TimeLineBar& bar : bars) {
    order.push_back(&bar);
    if (numbers.try_emplace(bar.Lane, lanes.size()).second) {
      lanes.push_back({bar.Lane, {}, {}});
    }
  }
  std::stable_sort(order.begin(), order.end(),
                   [](const TimeLineBar* a, const TimeLineBar* b) { return a->Begin < b->Begin; });
  for (const TimeLineBar* bar : order) {
    AddToLane(lanes[numbers[bar->Lane]], *bar, scale, bars.size() <= mostLabels);
  }
  return lanes;
}

std::string Attribute(const char* name, int value) {
  return std::string(" ") + name + "=\"" + std::to_string(value) + '"';
}

std::string Text(int x, int y, const char* textClass, const std::string& text) {
  return "<text class=\"" + std::string(textClass) + '"' + Attribute("x", x) + Attribute("y", y) +
         '>' + EscapeHtml(text) + "</text>";
}

std::string DrawAxis(const TimeScale& scale, int height) {
  std::string svg;
  int free = 0;  // a label that would run into the one before it is left out
  for (const TimeTick& tick : TicksBetween(scale.Begin, scale.End)) {
    const int x = scale.At(tick.Time);
    svg += "<line class=\"tick\"" + Attribute("x1", x) + Attribute("x2", x) +
           Attribute("y1", axisHeight - 6) + Attribute("y2", height) + "/>\n";
    const int labelWidth = static_cast<int>(tick.Label.size()) * letter;
    const int left = std::min(x - labelWidth / 2, width - labelWidth);
    if (left >= free) {
      svg += Text(left, axisHeight - 10, "tick-label", tick.Label) + '\n';
      free = left + labelWidth + letter;
    }
  }
  return svg;
}

void DrawBar(const PlacedBar& placed, int laneTop, bool hasLabels, std::ostream& out) {
  const TimeLineBar& bar = *placed.Bar;
  const int top = laneTop + lanePadding + placed.Row * rowHeight;
  const std::string title = EscapeHtml(bar.Title);
  out << "<a class=\"bar " << bar.StateClass << "\" href=\"" << bar.Link << "\" aria-label=\""
      << title << "\"><title>" << title << "</title><rect rx=\"3\"" << Attribute("x", placed.Left)
      << Attribute("y", top) << Attribute("width", placed.Width) << Attribute("height", barHeight)
      << "/>" << Text(placed.Left + 5, top + barHeight - 5, "mark", bar.Mark);
  if (hasLabels) {
    out << Text(placed.Left + placed.Width + 4, top + barHeight - 5, "bar-label",
                ShortenedLabel(bar.Label, longestLabel));
  }
  out << "</a>\n";
}

void DrawLane(const Lane& lane, int top, bool hasLabels, std::ostream& out) {
  out << "<rect class=\"lane\" x=\"0\"" << Attribute("y", top) << Attribute("width", width)
      << Attribute("height", lane.Height() - 2) << "/>\n"
      << Text(8, top + lanePadding + barHeight - 5, "lane-name",
              ShortenedLabel(lane.Name, longestLane))
      << '\n';
  for (const PlacedBar& bar : lane.Bars) {
    DrawBar(bar, top, hasLabels, out);
  }
}

}  // namespace

void DrawTimeLine(const std::vector<TimeLineBar>& bars, std::ostream& out) {
  if (bars.empty()) {
    return;
  }
  const TimeScale scale = ScaleOf(bars);
  const std::vector<Lane> lanes = LanesOf(bars, scale);
  int height = axisHeight;
  for (const Lane& lane : lanes) {
    height += lane.Height();
  }
  out << "<svg viewBox=\"0 0 " << width << ' ' << height << '"' << Attribute("width", width)
      << Attribute("height", height) << " role=\"group\" aria-label=\"Time line of the events\">\n";
  int top = axisHeight;
  for (const Lane& lane : lanes) {
    DrawLane(lane, top, bars.size() <= mostLabels, out);
    top += lane.Height();
  }
  out << DrawAxis(scale, height) << "</svg>\n";
}
