#include "app/options.h"

#include "app/install_event.h"
#include "platform/ascii_case.h"

std::span<const Option> Options() {
  static constexpr Option options[] = {
      {"-start", &CInstallEvent::EventID, "IDENTITY", "before the action: begins an event"},
      {"-end", &CInstallEvent::EventID, "IDENTITY", "after the action: ends the event"},
      {"-logmessage", &CInstallEvent::EventID, "IDENTITY", "during the action: adds a message"},
      {"-Command", &CInstallEvent::CommandLine, "TEXT", "-start: the installer's command line"},
      {"-message", &CInstallEvent::Message, "TEXT", "-logmessage: the message"},
      {"-CopyName", &CInstallEvent::CopyName, "NAME", "-end: the product copy"},
      {"-Type", &CInstallEvent::Type, "TEXT", "-start: install type, such as GUI or silent"},
      {"-Version", &CInstallEvent::Version, "TEXT", "-start: product version"},
      {"-ServiceLevel", &CInstallEvent::ServiceLevel, "TEXT", "-start: service level"},
      {"-Result", &CInstallEvent::Result, "TEXT", "-end: result of the action"},
      {"-Product", &CInstallEvent::Product, "TEXT", "-start: product and build level"},
      {"-Path", &CInstallEvent::Path, "FOLDER", "-start, -end: install path"},
      {"-Action", &CInstallEvent::Action, "TEXT", "-start, -end: installation action"},
      {"-l", &CInstallEvent::LogFile, "FILE", "-start, -end: the installer's log file"},
      {"-t", &CInstallEvent::TraceFile, "FILE", "-start, -end: its trace file"},
      {"-u", &CInstallEvent::ResponseFile, "FILE", "-start, -end: its response file"},
  };
  return options;
}

const Option* FindOption(std::string_view argument) {
  for (const Option& option : Options()) {
    if (EqualsIgnoringCase(option.Word, argument)) {
      return &option;
    }
  }
  return nullptr;
}
