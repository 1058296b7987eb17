#include "reader/event_section.h"

#include <algorithm>
#include <iterator>
#include <unordered_set>

#include "platform/ascii_case.h"

namespace {

struct Key {
  std::string_view Name;
  std::string_view EventSection::*Value;
};

constexpr Key keys[] = {
    {"Event_ID", &EventSection::EventID},
    {"Command_Line", &EventSection::CommandLine},
    {"Start_Time", &EventSection::StartTime},
    {"End_Time", &EventSection::EndTime},
    {"Action", &EventSection::Action},
    {"Type", &EventSection::Type},
    {"Product", &EventSection::Product},
    {"Version", &EventSection::Version},
    {"Service_Level", &EventSection::ServiceLevel},
    {"Path", &EventSection::Path},
    {"Copy_Name", &EventSection::CopyName},
    {"Complete_Flag", &EventSection::CompleteFlag},
    {"Log_File_Name", &EventSection::LogFileName},
    {"Trace_File", &EventSection::TraceFile},
    {"Response_File", &EventSection::ResponseFile},
    {"Event_Log_File", &EventSection::EventLogFile},
    {"Result", &EventSection::Result},
};

// A value ends at its first zero byte, as the recorder reads it.
std::string_view UpToZero(std::string_view text) { return text.substr(0, text.find('\0')); }

}  // namespace

bool ReadSection(const ProfileText& text, size_t section, EventSection& values) {
  values.Name = UpToZero(text.NameOf(section));
  bool hasKey = false;
  std::unordered_set<const Key*> seen;
  for (const ProfileLine& line : text.LinesOf(section)) {
    const auto* const key = std::find_if(std::begin(keys), std::end(keys), [&line](const Key& k) {
      return EqualsIgnoringCase(k.Name, line.Key);
    });
    if (key != std::end(keys) && seen.insert(key).second) {
      values.*key->Value = UpToZero(line.Value);
      hasKey = true;
    }
  }
  return hasKey;
}

bool HasEnded(const EventSection& section) {
  return EqualsIgnoringCase(section.CompleteFlag, "TRUE") || !section.EndTime.empty();
}

EventState StateOf(const EventSection& section) {
  if (section.StartTime.empty() && section.EventID.empty()) {
    return EventState::kNoStart;
  }
  return HasEnded(section) ? StateOfResult(section.Result) : EventState::kOpen;
}
