#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

// A time of the machine's local clock, in seconds since the start of 1970 on that clock.
using LocalTime = int64_t;

// The time in the form "20261114 22:00:03"; nothing for any other text and for a day or an hour
// that does not exist.
std::optional<LocalTime> ParseLocalTime(std::string_view text);

// "2026-11-14T22:00:03".
std::string IsoTime(LocalTime time);
