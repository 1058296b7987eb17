#include "reader/event_facts.h"

#include <string>
#include <utility>

#include "reader/history_files.h"

namespace {

// The texts that the history file or the report has.
constexpr std::string Event::*texts[] = {
    &Event::Identity,     &Event::Action, &Event::Type, &Event::Product, &Event::Version,
    &Event::ServiceLevel, &Event::Path,   &Event::Copy, &Event::Result,  &Event::CommandLine};

void AddStart(const StartBlock& start, const TextDecoder& decoder, Event& event) {
  event.Identity = decoder.ToUtf8(start.Identity);
  event.Started = ParseLocalTime(start.Time);
  event.Product = decoder.ToUtf8(start.Product);
  event.ServiceLevel = decoder.ToUtf8(start.ServiceLevel);
  event.CommandLine = decoder.ToUtf8(start.CommandLine);
}

void AddResult(const ResultBlock& result, const TextDecoder& decoder, Event& event) {
  if (const auto started = ParseLocalTime(result.StartTime)) {
    event.Started = started;
  }
  event.Ended = ParseLocalTime(result.EndTime);
  event.Action = decoder.ToUtf8(result.Action);
  event.Product = decoder.ToUtf8(result.Product);
  event.ServiceLevel = decoder.ToUtf8(result.ServiceLevel);
  event.Type = decoder.ToUtf8(result.Type);
  event.Result = decoder.ToUtf8(result.Result);
}

}  // namespace

Event EventOfSection(const EventSection& section, const TextDecoder& decoder) {
  constexpr std::string_view EventSection::*values[] = {
      &EventSection::Name,       &EventSection::Action,   &EventSection::Type,
      &EventSection::Product,    &EventSection::Version,  &EventSection::ServiceLevel,
      &EventSection::Path,       &EventSection::CopyName, &EventSection::Result,
      &EventSection::CommandLine};
  static_assert(std::size(values) == std::size(texts));
  Event event;
  for (size_t i = 0; i < std::size(values); ++i) {
    event.*texts[i] = decoder.ToUtf8(section.*values[i]);
  }
  event.State = StateOf(section);
  event.Started = ParseLocalTime(section.StartTime);
  event.Ended = ParseLocalTime(section.EndTime);
  for (const auto& [key, value] :
       {std::pair("Log_File_Name", section.LogFileName), std::pair("Trace_File", section.TraceFile),
        std::pair("Response_File", section.ResponseFile)}) {
    if (!value.empty() && value != "(none)") {
      EventFile& file = event.Files.emplace_back();
      file.Key = key;
      file.Path = decoder.ToUtf8(value);
      file.Name = LastPart(file.Path);
    }
  }
  return event;
}

void AddFactsOfRun(const ReportRun& run, const TextDecoder& decoder, Event& event) {
  if (run.Computer) {
    event.Computer = decoder.ToUtf8(*run.Computer);
  }
  if (event.Origin == EventOrigin::kSection) {
    return;
  }
  event.State = run.Start ? EventState::kOpen : EventState::kNoStart;
  event.Action = decoder.ToUtf8(run.StartAction);
  if (run.Start) {
    AddStart(*run.Start, decoder, event);
  }
  if (run.Result) {
    AddResult(*run.Result, decoder, event);
    event.State = run.Start ? StateOfResult(event.Result) : event.State;
  }
}

size_t BytesOfFacts(const Event& event) {
  size_t bytes = event.Computer.value_or("").size() + event.Report.value_or("").size();
  for (const auto& text : texts) {
    bytes += (event.*text).size();
  }
  for (const EventFile& file : event.Files) {
    bytes += file.Path.size() + file.Name.size();
  }
  return bytes;
}
