#include "reader/time_axis.h"

#include <algorithm>
#include <chrono>
#include <cstdio>

using std::chrono::days;
using std::chrono::sys_days;
using std::chrono::year_month_day;

static constexpr int64_t hour = 3600;
static constexpr int64_t day = 24 * hour;
static constexpr size_t mostTicks = 9;

static year_month_day DateOf(LocalTime time) {
  const int64_t dayNumber = time / day - (time % day < 0 ? 1 : 0);
  return {sys_days(days(dayNumber))};
}

static std::string Format(LocalTime time, int64_t step) {
  const year_month_day date = DateOf(time);
  const auto year = static_cast<int>(date.year());
  const auto month = static_cast<unsigned>(date.month());
  const auto dayOfMonth = static_cast<unsigned>(date.day());
  const int64_t second = time - sys_days(date).time_since_epoch().count() * day;
  char text[40] = {};
  if (step < day) {
    std::snprintf(text, sizeof text, "%02u-%02u %02d:%02d", month, dayOfMonth,
                  static_cast<int>(second / hour), static_cast<int>(second % hour / 60));
  } else {
    std::snprintf(text, sizeof text, "%04d-%02u-%02u", year, month, dayOfMonth);
  }
  return text;
}

// Ticks at the first day of every so many months, counted from January of a round year.
static std::vector<TimeTick> MonthTicks(LocalTime begin, LocalTime end, int months) {
  std::vector<TimeTick> ticks;
  const std::chrono::years past(static_cast<int>(DateOf(begin).year()) % std::max(months / 12, 1));
  auto month = (DateOf(begin).year() - past) / std::chrono::January;
  for (;; month += std::chrono::months(months)) {
    const LocalTime time = sys_days(month / 1).time_since_epoch().count() * day;
    if (time > end) {
      return ticks;
    }
    if (time >= begin) {
      ticks.push_back({time, Format(time, day)});
    }
  }
}

static std::vector<TimeTick> EvenTicks(LocalTime begin, LocalTime end, int64_t step) {
  std::vector<TimeTick> ticks;
  for (LocalTime time = (begin + step - 1) / step * step; time <= end; time += step) {
    ticks.push_back({time, Format(time, step)});
  }
  if (ticks.empty()) {
    ticks.push_back({begin, Format(begin, step)});
  }
  return ticks;
}

std::vector<TimeTick> TicksBetween(LocalTime begin, LocalTime end) {
  const int64_t range = std::max<int64_t>(end - begin, 0);
  constexpr int64_t steps[] = {60,       300,       900, 1800,    hour,   3 * hour,
                               6 * hour, 12 * hour, day, 2 * day, 7 * day};
  for (const int64_t step : steps) {
    if (static_cast<size_t>(range / step) < mostTicks) {
      return EvenTicks(begin, end, step);
    }
  }
  for (const int months : {1, 2, 3, 6, 12, 24, 60, 120}) {
    const int64_t step = 28 * day * months;
    if (static_cast<size_t>(range / step) < mostTicks) {
      return MonthTicks(begin, end, months);
    }
  }
  return MonthTicks(begin, end, 12 * 1000);
}
