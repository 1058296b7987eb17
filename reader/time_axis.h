#pragma once

#include <string>
#include <vector>

#include "reader/event_time.h"

struct TimeTick {
  LocalTime Time = 0;
  std::string Label;  // a date, or a time of day within a short range
};

// The round times within a range, at most nine: minutes, hours, days, months or years, depending on
// its length; only its beginning if there is none. All labels have the same form.
std::vector<TimeTick> TicksBetween(LocalTime begin, LocalTime end);
