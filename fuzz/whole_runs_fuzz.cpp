#include <filesystem>
#include <iostream>
#include <set>
#include <utility>

#include "app/install_history.h"
#include "fuzz/history_model.h"
#include "history/locations.h"
#include "platform/path.h"
#include "tests/support/archive_reader.h"
#include "tests/support/fake_machine.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

// The command lines of up to four runs over one new history: arguments with a NUL between them,
// runs with an RS (0x1E). Each event has the fields that the model finds. After each run the
// history file is byte for byte that of the model, the event reads as the model does, and nothing
// was made outside the history folder, which has a link that leads out.

namespace {

namespace fs = std::filesystem;

HistoryModel HistoryNow() { return HistoryModel(FileText(GetHistoryFilePath())); }

// What an event has of its command line. A start writes: here there is no folder for it.
void CheckFields(const CommandLineModel& line, const std::vector<std::string>& words) {
  const std::string folder = std::exchange(Machine().CommonFolder, "/no/folder");
  ProgramArguments arguments(words);
  const Event event(arguments.Count(), arguments.Vector());
  Require(event.Mode == line.Mode && event.Valid == line.NamesEvent());
  Require(event.EventFolder == (event.Valid ? JoinPath(GetHistoryDir(), event.EventID) : ""));
  Require(event.Valid == event.EventLogPath.ends_with("ORXInstallEvent.Log"));
  for (const OptionModel& option : kOptions) {
    Require(event.*option.Field == line.Value(option.Key));
  }
  Machine().CommonFolder = folder;
}

// The log of an event whose folder is one, with no link on the way: it cannot fail to be written.
void CheckLog(const CommandLineModel& line, const std::string& before, const std::string& after) {
  if (line.Mode == "-logmessage") {
    Require(after == before + line.Value("Message") + '\n');
  } else if (line.Mode == "-start") {
    Require(after.starts_with("---------- ORX Installation History Logger ( Start )"));
    Require(after.find("\nCommandLine   :" + line.Value("Command_Line") + '\n') !=
            std::string::npos);
  }
}

void UpdateModel(HistoryModel& model, const CommandLineModel& line, const std::string& logPath) {
  const std::string identity = line.Value("Event_ID");
  const HistoryModel now = HistoryNow();
  const std::string time = now.Stored(identity, line.Mode == "-start" ? "Start_Time" : "End_Time");
  Require(WithoutTimes(time) == "<time>");
  if (line.Mode == "-start") {
    model.Start(line, time, logPath);
    return;
  }
  model.End(line, time);
  // Whether the folder was moved shows in its key; which names can be moved depends on the system.
  if (now.Stored(identity, "Event_Log_File") != model.Stored(identity, "Event_Log_File")) {
    const std::string folder =
        JoinPath(JoinPath(GetHistoryDir(), line.Value("Copy_Name")), identity);
    Require(fs::is_directory(folder));
    model.Set(identity, "Event_Log_File", JoinPath(folder, "ORXInstallEvent.Log"));
  }
}

void RunEvent(HistoryModel& model, const std::vector<std::string>& words) {
  const CommandLineModel line(words);
  CheckFields(line, words);
  const std::string identity = line.Value("Event_ID");
  const std::string folder = JoinPath(GetHistoryDir(), identity);
  const std::string logPath = JoinPath(folder, "ORXInstallEvent.Log");
  const std::string before = FileText(logPath);
  Require(RunTool(words) == (line.NamesEvent() ? 0 : 2));
  if (line.NamesEvent() && line.Mode != "-logmessage") {
    UpdateModel(model, line, logPath);
  }
  std::error_code ignored;
  const bool isFolder = fs::canonical(folder, ignored) == folder && fs::is_directory(folder);
  if (line.NamesEvent() && isFolder && !fs::is_directory(logPath)) {
    CheckLog(line, before, FileText(logPath));
  }
  const Event event(identity);
  for (const OptionModel& option : kOptions) {
    Require(option.Get == nullptr || (event.*option.Get)() == model.Read(identity, option.Key));
  }
  Require(event.GetCompleteFlag() == model.Read(identity, "Complete_Flag"));
  Require(event.GetEventLogFile() == model.Read(identity, "Event_Log_File"));
}

// Which of the installer's files were collected shows in their keys too.
void RunReport(HistoryModel& model, const std::string& archive) {
  Require(CInstallHistory().Report(archive) == 1);
  for (const ArchiveEntry& entry : ReadArchive(archive)) {
    Require(entry.IsWhole && !entry.Name.starts_with('/') && !LeadsElsewhere(entry.Name));
  }
  for (const std::string& section : model.EventSections()) {
    for (const char* key : {"Log_File_Name", "Trace_File", "Response_File"}) {
      const std::string now = HistoryNow().Stored(section, key);
      if (now != model.Stored(section, key)) {
        Require(now.starts_with(GetHistoryDir() + "/") && FileExists(now));
        model.Set(section, key, now);
      }
    }
  }
}

void CheckFiles(const std::string& root) {
  std::set<std::string> outside;
  for (const fs::directory_entry& entry : fs::recursive_directory_iterator(root)) {
    if (!entry.path().string().starts_with(GetHistoryDir() + '/')) {
      outside.insert(entry.path().string().substr(root.size()));
    }
  }
  outside.erase("/archive/a.zip");
  Require(outside == std::set<std::string>({"/ZEK", "/ZEK/ORXHistory", "/archive", "/outside"}));
  Require(!fs::is_regular_file(JoinPath(GetHistoryDir(), ".History.tmp")));
}

}  // namespace

void CheckInput(const std::string& input) {
  constexpr size_t mostRuns = 4;
  std::cout.setstate(std::ios::failbit);  // nothing is printed
  std::vector<std::string> runs = Split(input, '\x1E');
  runs.resize(std::min(runs.size(), mostRuns));
  const ScratchHistory scratch;
  scratch.Make("archive/");
  scratch.Make("outside/");
  HistoryModel model;
  for (const std::string& run : runs) {
    if (run == "-report" && fs::exists(GetHistoryDir())) {
      RunReport(model, scratch.Root + "/archive/a.zip");
    } else {
      RunEvent(model, Split(run, '\0'));
    }
    Require(FileText(GetHistoryFilePath()) == model.Text());
    Require(CInstallHistory().EventCount == model.Starts);
    Require(CInstallHistory().GetEventSections() == model.EventSections());
    std::error_code ignored;
    fs::create_symlink("../../outside", JoinPath(GetHistoryDir(), "link"), ignored);
  }
  CheckFiles(scratch.Root);
}
