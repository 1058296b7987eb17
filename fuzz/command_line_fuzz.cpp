#include <cstdint>
#include <iostream>
#include <string>
#include <vector>

#include "app/install_event.h"
#include "fuzz/history_model.h"
#include "fuzz/require.h"
#include "fuzz/words.h"
#include "history/locations.h"
#include "platform/path.h"
#include "platform/profile_file.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

// Arguments with a NUL between them, and the record that is made of them: every field is what a
// plain walk finds, and what is stored of it reads back by the rules of profile files. There is no
// history folder, so that nothing gets beyond memory; whole_runs_fuzz.cpp goes on from there.

namespace {

using Text = std::string;

struct OptionRoute {
  const char* Option;
  Text CInstallEvent::*Field;
  const char* Key;
  void (CInstallEvent::*Set)(const Text&);
  Text (CInstallEvent::*Get)() const;
};

using Event = CInstallEvent;

constexpr OptionRoute routes[] = {
    {"-Command", &Event::CommandLine, "Command_Line", &Event::SetCommandLine,
     &Event::GetCommandLine},
    {"-CopyName", &Event::CopyName, "Copy_Name", &Event::SetCopyName, &Event::GetCopyName},
    {"-Type", &Event::Type, "Type", &Event::SetType, &Event::GetType},
    {"-Version", &Event::Version, "Version", &Event::SetVersion, &Event::GetVersion},
    {"-ServiceLevel", &Event::ServiceLevel, "Service_Level", &Event::SetServiceLevel,
     &Event::GetServiceLevel},
    {"-Result", &Event::Result, "Result", &Event::SetResult, &Event::GetResult},
    {"-Product", &Event::Product, "Product", &Event::SetProduct, &Event::GetProduct},
    {"-Path", &Event::Path, "Path", &Event::SetPath, &Event::GetPath},
    {"-Action", &Event::Action, "Action", &Event::SetAction, &Event::GetAction},
    {"-l", &Event::LogFile, "Log_File_Name", &Event::SetLogFileName, &Event::GetLogFileName},
    {"-t", &Event::TraceFile, "Trace_File", &Event::SetTraceFile, &Event::GetTraceFile},
    {"-u", &Event::ResponseFile, "Response_File", &Event::SetResponseFile, &Event::GetResponseFile},
};

void CheckRecord(const CInstallEvent& event, const CommandLineModel& line) {
  Require(event.Mode == line.Mode && event.EventID == line.Identity);
  Require(event.Message == line.Value("-message"));
  for (const OptionRoute& route : routes) {
    Require(event.*route.Field == line.Value(route.Option));
  }
  Require(event.Valid == line.NamesEvent());
  Require(event.EventFolder == (event.Valid ? JoinPath(GetHistoryDir(), line.Identity) : ""));
  Require(event.Valid == event.EventLogPath.ends_with("ORXInstallEvent.Log"));
}

void CheckStoring(CInstallEvent& event, const CommandLineModel& line) {
  HistoryModel model;
  for (const OptionRoute& route : routes) {
    (event.*route.Set)(event.*route.Field);
    model.Set(line.Identity, route.Key, line.Value(route.Option));
  }
  for (const OptionRoute& route : routes) {
    Require((event.*route.Get)() == model.Read(line.Identity, route.Key));
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const ScratchHistory scratch;
  std::cout.setstate(std::ios::failbit);  // no folder can be made, and that need not be said
  const std::vector<std::string> words = Split(std::string(data, data + size), '\0');
  const CommandLineModel line(words);
  ProgramArguments arguments(words);
  // Writes under a guard are kept until its end, when it turns out that they have no place to go.
  const ProfileGuard guard(GetHistoryFilePath());
  CInstallEvent event(arguments.Count(), arguments.Vector());
  CheckRecord(event, line);
  CheckStoring(event, line);
  return 0;
}
