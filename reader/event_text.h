#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "reader/history.h"

// What an event is called and what is known of it, as the text views print it. The texts are UTF-8,
// but not yet made printable.

struct Fact {
  std::string_view Name;
  std::string Text;
};

// The facts that are known, in the order of a history file. Times as "2026-11-14 22:00:03".
std::vector<Fact> FactsOf(const Event& event);

// "Event 1007: Upgrade, ORX Server Build 1960, copy Prod".
std::string TitleOf(const Event& event);

// "2026-11-14 22:00:03 to 22:41:55 (42 min), failed: Failed (1603)".
std::string CourseOf(const Event& event);

// "2026-11-14 22:00:03".
std::string TextOfTime(LocalTime time);

// "35 s", "42 min", "2 h 05 min", "3 d 04 h"; empty without a start or an end.
std::string DurationOf(const Event& event);

// What a change did to the fields of its item: "4096 -> 8192", "version 9.1 -> 9.2"; for an item
// that was added or removed, its fields. Empty for one without fields.
std::string TextOfFields(const Change& change);

// The item and what happened to it: "services: ORX Server - Prod Started -> Stopped".
std::string TextOfChange(const Change& change);
