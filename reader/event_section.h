#pragma once

#include <cstddef>
#include <string_view>

#include "platform/profile_text.h"
#include "reader/history.h"

// The values of an event's section as they are in the file.
struct EventSection {
  std::string_view Name;
  std::string_view EventID;
  std::string_view CommandLine;
  std::string_view StartTime;
  std::string_view EndTime;
  std::string_view Action;
  std::string_view Type;
  std::string_view Product;
  std::string_view Version;
  std::string_view ServiceLevel;
  std::string_view Path;
  std::string_view CopyName;
  std::string_view CompleteFlag;
  std::string_view LogFileName;
  std::string_view TraceFile;
  std::string_view ResponseFile;
  std::string_view EventLogFile;
  std::string_view Result;
};

// Reads the section of that index (ProfileText::NameOf). False if it has no key of an event. The
// values are views into the text.
bool ReadSection(const ProfileText& text, size_t section, EventSection& values);

// True if the complete flag is TRUE or there is an end time.
bool HasEnded(const EventSection& section);

// kNoStart if the section has neither a start time nor an Event_ID; else open, or by its result.
EventState StateOf(const EventSection& section);
