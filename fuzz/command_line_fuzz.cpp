#include <cstdint>
#include <iostream>
#include <string>
#include <vector>

#include "app/install_event.h"
#include "fuzz/history_model.h"
#include "fuzz/support.h"
#include "history/locations.h"
#include "platform/path.h"
#include "platform/profile_file.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

// Arguments with a NUL between them, and the record that is made of them: every field is what the
// model finds, and what is stored of it reads back by the rules of profile files. There is no
// history folder, so that nothing leaves memory; whole_runs_fuzz.cpp has one.

namespace {

void CheckRecord(const CInstallEvent& event, const CommandLineModel& line) {
  Require(event.Mode == line.Mode && event.EventID == line.Identity);
  Require(event.Message == line.Message);
  for (const KeyRoute& route : kKeyRoutes) {
    Require(route.Field == nullptr || event.*route.Field == line.Value(route.Key));
  }
  Require(event.Valid == line.NamesEvent());
  Require(event.EventFolder == (event.Valid ? JoinPath(GetHistoryDir(), line.Identity) : ""));
  Require(event.Valid == event.EventLogPath.ends_with("ORXInstallEvent.Log"));
}

void CheckStoring(CInstallEvent& event, const CommandLineModel& line) {
  HistoryModel model;
  for (const KeyRoute& route : kKeyRoutes) {
    if (route.Option != nullptr) {
      (event.*route.Set)(event.*route.Field);
      model.Set(line.Identity, route.Key, line.Value(route.Key));
    }
  }
  for (const KeyRoute& route : kKeyRoutes) {
    Require(route.Option == nullptr ||
            (event.*route.Get)() == model.Read(line.Identity, route.Key));
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const ScratchHistory scratch;
  std::cout.setstate(std::ios::failbit);  // no folder can be made, and that is not to be printed
  const std::vector<std::string> words = Split(std::string(data, data + size), '\0');
  const CommandLineModel line(words);
  ProgramArguments arguments(words);
  // Writes under a guard are kept until its end; only then do they fail.
  const ProfileGuard guard(GetHistoryFilePath());
  CInstallEvent event(arguments.Count(), arguments.Vector());
  CheckRecord(event, line);
  CheckStoring(event, line);
  return 0;
}
