#include <cstdint>
#include <filesystem>
#include <iostream>
#include <sstream>
#include <string>
#include <string_view>
#include <vector>

#include "app/install_event.h"
#include "app/install_history.h"
#include "fuzz/history_model.h"
#include "fuzz/support.h"
#include "history/locations.h"
#include "platform/path.h"
#include "platform/profile_text.h"
#include "tests/support/archive_reader.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

// The command lines of up to four runs over one new history: arguments with a NUL between them,
// runs with an RS (0x1E). After each run the history file is byte for byte that of the model, the
// event reads as the model does, and nothing was made outside the history folder, which has a link
// that leads out.

namespace {

namespace fs = std::filesystem;
using Words = std::vector<std::string>;

std::string StoredNow(const std::string& section, const std::string& key) {
  const ProfileText file(FileText(GetHistoryFilePath()));
  return std::string(file.Find(HistoryModel::OnOneLine(section), key).value_or(""));
}

std::string TimeNow(const std::string& section, const std::string& key) {
  const std::string time = StoredNow(section, key);
  Require(time.size() == 17 && time[8] == ' ' && time[11] == ':' && time[14] == ':');
  return time;
}

void CheckGetters(const HistoryModel& model, const std::string& identity) {
  const CInstallEvent event(identity);
  for (const KeyRoute& route : kKeyRoutes) {
    Require((event.*route.Get)() == model.Read(identity, route.Key));
  }
}

// Whether a folder was moved shows in its key; which names can be moved depends on the system.
void FollowMove(HistoryModel& model, const CommandLineModel& line) {
  const std::string& identity = line.Identity;
  if (StoredNow(identity, "Event_Log_File") != model.Stored(identity, "Event_Log_File")) {
    const std::string folder =
        JoinPath(JoinPath(GetHistoryDir(), line.Value("Copy_Name")), identity);
    Require(fs::is_directory(folder));
    model.Set(identity, "Event_Log_File", JoinPath(folder, "ORXInstallEvent.Log"));
  }
}

// What the logs of events with ordinary names hold; none of them can fail to be written.
void CheckLog(const CommandLineModel& line, const std::string& before, bool isWritable) {
  const std::string path =
      JoinPath(JoinPath(GetHistoryDir(), line.Identity), "ORXInstallEvent.Log");
  const std::string after = FileText(path);
  if (line.Mode == "-logmessage") {
    Require(after == (isWritable ? before + line.Message + '\n' : before));
  } else if (line.Mode == "-start" && isWritable) {
    Require(after.starts_with("---------- ORX Installation History Logger ( Start )"));
    Require(after.find("\nCommandLine   :" + line.Value("Command_Line") + '\n') !=
            std::string::npos);
  }
}

bool IsOrdinary(const std::string& name) {
  return name.size() < 100 && std::all_of(name.begin(), name.end(),
                                          [](unsigned char c) { return std::isalnum(c) != 0; });
}

void RunEvent(HistoryModel& model, const Words& words) {
  const CommandLineModel line(words);
  const std::string folder = JoinPath(GetHistoryDir(), line.Identity);
  const std::string logPath = JoinPath(folder, "ORXInstallEvent.Log");
  const bool isOrdinary = line.NamesEvent() && IsOrdinary(line.Identity);
  const std::string before = isOrdinary ? FileText(logPath) : "";
  Require(RunTool(words) == (line.NamesEvent() ? 0 : 2));
  if (line.NamesEvent() && line.Mode == "-start") {
    model.Start(line, TimeNow(line.Identity, "Start_Time"), logPath);
  } else if (line.NamesEvent() && line.Mode == "-end") {
    model.End(line, TimeNow(line.Identity, "End_Time"));
    FollowMove(model, line);
  }
  if (isOrdinary) {
    const bool isWritable = fs::is_directory(fs::symlink_status(folder)) &&
                            !fs::is_directory(fs::symlink_status(logPath));
    CheckLog(line, before, isWritable);
  }
  CheckGetters(model, line.Identity);
}

// Which of the installer's files were collected shows in their keys too.
void RunReport(HistoryModel& model, const std::string& archive) {
  Require(CInstallHistory().Report(archive) == 1);
  for (const ArchiveEntry& entry : ReadArchive(archive)) {
    Require(entry.IsWhole && !entry.Name.starts_with('/') && !LeadsElsewhere(entry.Name));
  }
  for (const std::string& section : model.EventSections()) {
    for (const char* key : {"Log_File_Name", "Trace_File", "Response_File"}) {
      const std::string now = StoredNow(section, key);
      if (now != model.Stored(section, key)) {
        Require(now.starts_with(GetHistoryDir() + "/") && FileExists(now));
        model.Set(section, key, now);
      }
    }
  }
}

Words NamesIn(const std::string& folder) {
  Words names;
  for (const fs::directory_entry& entry : fs::directory_iterator(folder)) {
    names.push_back(entry.path().filename().string());
  }
  std::sort(names.begin(), names.end());
  return names;
}

void CheckFiles(const std::string& root) {
  Require(NamesIn(root) == Words({"ZEK", "archive", "outside"}));
  Require(NamesIn(root + "/ZEK") == Words({"ORXHistory"}));
  Require(NamesIn(root + "/outside").empty());
  Require(!fs::is_regular_file(JoinPath(GetHistoryDir(), ".History.tmp")));
}

void Silence() {
  static std::stringbuf nothing;
  nothing.str("");
  std::cout.rdbuf(&nothing);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  constexpr size_t mostRuns = 4;
  Silence();
  Words runs = Split(std::string(data, data + size), '\x1E');
  runs.resize(std::min(runs.size(), mostRuns));
  const ScratchHistory scratch;
  fs::create_directory(scratch.Root + "/archive");
  fs::create_directory(scratch.Root + "/outside");
  HistoryModel model;
  for (const std::string& run : runs) {
    const Words words = Split(run, '\0');
    if (words == Words({"-report"}) && fs::exists(GetHistoryDir())) {
      RunReport(model, scratch.Root + "/archive/a.zip");
    } else {
      RunEvent(model, words);
    }
    Require(FileText(GetHistoryFilePath()) == model.Text());
    Require(CInstallHistory().EventCount == model.Starts());
    Require(CInstallHistory().GetEventSections() == model.EventSections());
    std::error_code ignored;
    fs::create_symlink("../../outside", JoinPath(GetHistoryDir(), "link"), ignored);
  }
  CheckFiles(scratch.Root);
  return 0;
}
