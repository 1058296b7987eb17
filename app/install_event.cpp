#include "app/install_event.h"

#include <iostream>
#include <string_view>

#include "history/locations.h"
#include "platform/ascii_case.h"

namespace {

struct Option {
  std::string_view Word;
  std::string CInstallEvent::*Field;
};

// In the order in which an argument is compared with them.
constexpr Option options[] = {
    {"-start", &CInstallEvent::EventID},
    {"-end", &CInstallEvent::EventID},
    {"-logmessage", &CInstallEvent::EventID},
    {"-Command", &CInstallEvent::CommandLine},
    {"-message", &CInstallEvent::Message},
    {"-CopyName", &CInstallEvent::CopyName},
    {"-Type", &CInstallEvent::Type},
    {"-Version", &CInstallEvent::Version},
    {"-ServiceLevel", &CInstallEvent::ServiceLevel},
    {"-Result", &CInstallEvent::Result},
    {"-Product", &CInstallEvent::Product},
    {"-Path", &CInstallEvent::Path},
    {"-Action", &CInstallEvent::Action},
    {"-l", &CInstallEvent::LogFile},
    {"-t", &CInstallEvent::TraceFile},
    {"-u", &CInstallEvent::ResponseFile},
};

const Option* FindOption(std::string_view argument) {
  for (const Option& option : options) {
    if (EqualsIgnoringCase(option.Word, argument)) {
      return &option;
    }
  }
  return nullptr;
}

}  // namespace

CInstallEvent::CInstallEvent(int argc, char** argv) : Ini(GetHistoryFilePath()) {
  ParseOptions(argc, argv);
  CheckMode();
  if (!Valid) {
    return;
  }
  EventFolder = JoinPath(GetHistoryDir(), EventID);
  EventLogPath = JoinPath(EventFolder, "ORXInstallEvent.Log");
  if (Mode == "-start") {
    WriteDefaults();
    CreateEventFolder();
  }
}

CInstallEvent::CInstallEvent(const std::string& identity)
    : EventID(identity), Ini(GetHistoryFilePath()) {}

void CInstallEvent::ParseOptions(int argc, char** argv) {
  // The last argument has no value behind it, so it is no option whatever it says.
  for (int i = 1; i + 1 < argc; ++i) {
    const Option* option = FindOption(argv[i]);
    if (option == nullptr) {
      continue;
    }
    ++i;
    this->*option->Field = argv[i];
    if (option->Field == &CInstallEvent::EventID) {
      Mode = option->Word;
    }
  }
}

void CInstallEvent::CheckMode() { Valid = !Mode.empty() && !EventID.empty(); }

void CInstallEvent::WriteDefaults() {
  SetEventID(EventID);
  SetCommandLine("");
  SetStartTime("");
  SetEndTime("");
  SetAction("");
  SetType("");
  SetProduct("");
  SetVersion("");
  SetServiceLevel("");
  SetPath("");
  SetCopyName("(Unknown)");
  SetCompleteFlag("FALSE");
  SetLogFileName("(none)");
  SetTraceFile("(none)");
  SetResponseFile("(none)");
  SetEventLogFile(EventLogPath);
  SetResult("");
}

bool CInstallEvent::CreateEventFolder() const {
  if (!LeadsOutOfHistory(EventID) && EnsureFolder(EventFolder)) {
    return true;
  }
  std::cout << " Failed to create path:" << EventFolder;
  return false;
}
