#include "reader/event_time.h"

#include <chrono>
#include <cstdio>

namespace {

// Nothing if a character is no digit.
std::optional<int> Number(std::string_view digits) {
  int number = 0;
  for (const char digit : digits) {
    if (digit < '0' || digit > '9') {
      return std::nullopt;
    }
    number = number * 10 + (digit - '0');
  }
  return number;
}

}  // namespace

std::optional<LocalTime> ParseLocalTime(std::string_view text) {
  using namespace std::chrono;
  if (text.size() != 17 || text[8] != ' ' || text[11] != ':' || text[14] != ':') {
    return std::nullopt;
  }
  const auto years = Number(text.substr(0, 4));
  const auto months = Number(text.substr(4, 2));
  const auto days = Number(text.substr(6, 2));
  const auto hour = Number(text.substr(9, 2));
  const auto min = Number(text.substr(12, 2));
  const auto sec = Number(text.substr(15, 2));
  if (!years || !months || !days || !hour || !min || !sec) {
    return std::nullopt;
  }
  const year_month_day date =
      year(*years) / month(static_cast<unsigned>(*months)) / day(static_cast<unsigned>(*days));
  if (!date.ok() || *hour > 23 || *min > 59 || *sec > 59) {
    return std::nullopt;
  }
  const auto time = sys_days(date) + hours(*hour) + minutes(*min) + seconds(*sec);
  return duration_cast<seconds>(time.time_since_epoch()).count();
}

std::string IsoTime(LocalTime time) {
  using namespace std::chrono;
  const sys_seconds moment{seconds(time)};
  const auto midnight = floor<days>(moment);
  const year_month_day date{midnight};
  const hh_mm_ss clock{moment - midnight};
  char text[64] = {};
  std::snprintf(text, sizeof text, "%04d-%02u-%02uT%02d:%02d:%02d", static_cast<int>(date.year()),
                static_cast<unsigned>(date.month()), static_cast<unsigned>(date.day()),
                static_cast<int>(clock.hours().count()), static_cast<int>(clock.minutes().count()),
                static_cast<int>(clock.seconds().count()));
  return text;
}
