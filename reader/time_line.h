#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "reader/event_time.h"

// One event on the time line. Texts are plain: the time line escapes them.
struct TimeLineBar {
  std::string Lane;        // bars with the same text share a lane
  std::string Label;       // beside the bar
  std::string Title;       // what a pointer or a screen reader gets
  std::string Link;        // the fragment to jump to, such as "#event-3"
  std::string StateClass;  // the CSS class that colours the bar
  std::string Mark;        // inside the bar: says the state without its colour
  LocalTime Begin = 0;
  LocalTime End = 0;  // not before Begin
};

// Writes the bars over a common time axis, as an inline SVG element of 960 units width: a lane for
// each Lane text in the order of first use, bars that would overlap one below the other. A short
// event is drawn wide enough to be seen and hit. Nothing for no bars.
void DrawTimeLine(const std::vector<TimeLineBar>& bars, std::ostream& out);
