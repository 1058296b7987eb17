#include <iostream>

#include "fuzz/history_model.h"
#include "history/locations.h"
#include "platform/path.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

// Arguments with a NUL between them, and the record that is made of them: every field is what the
// model finds, and what is stored of it reads back by the rules of profile files. There is no
// history folder, so that nothing leaves memory; whole_runs_fuzz.cpp has one.

void CheckInput(const std::string& input) {
  static const ScratchHistory scratch;
  std::cout.setstate(std::ios::failbit);  // no folder can be made, and that is not to be printed
  const std::vector<std::string> words = Split(input, '\0');
  const CommandLineModel line(words);
  const std::string identity = line.Value("Event_ID");
  ProgramArguments arguments(words);
  // Writes under a guard are kept until its end; only then do they fail.
  const ProfileGuard guard(GetHistoryFilePath());
  CInstallEvent event(arguments.Count(), arguments.Vector());
  Require(event.Mode == line.Mode && event.Valid == line.NamesEvent());
  Require(event.EventFolder == (event.Valid ? JoinPath(GetHistoryDir(), identity) : ""));
  Require(event.Valid == event.EventLogPath.ends_with("ORXInstallEvent.Log"));

  HistoryModel model;
  for (const OptionModel& option : kOptions) {
    const std::string value = line.Value(option.Key);
    Require(event.*option.Field == value);
    event.Ini.WriteString(identity, option.Key, value);
    model.Set(identity, option.Key, value);
  }
  CheckGetters(event, model);
}
