#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "app/install_event.h"
#include "history/locations.h"
#include "platform/path.h"
#include "tests/fake_machine.h"

namespace {

namespace fs = std::filesystem;

TEST(CollectedFiles, AreCopiedOnceOrLeftWhereTheyAre) {
  const ScratchHistory scratch;
  const std::string event7 = JoinPath(JoinPath(GetHistoryDir(), "C1"), "7");
  const std::string uncopied7 = JoinPath(GetHistoryDir(), "7");
  const std::string setup = JoinPath(scratch.Root, "setup");
  const auto installer = [&](const char* name) { return JoinPath(setup, name); };
  const auto collected = [&](const char* name) { return JoinPath(event7, name); };
  for (const std::string& folder : {event7, uncopied7, setup, JoinPath(scratch.Root, "7")}) {
    fs::create_directories(folder);
  }
  for (const char* name : {"a.log", "b.trc", "c.log", "ORXInstallEvent.Log"}) {
    WriteFileText(installer(name), name);
  }
  WriteFileText(JoinPath(scratch.Root, "a.log"), "another a.log");
  WriteFileText(JoinPath(scratch.Root, "up.trc"), "up");
  WriteFileText(collected("ORXInstallEvent.Log"), "report");
  const fs::file_time_type time = fs::last_write_time(installer("a.log")) - std::chrono::hours(5);
  fs::last_write_time(installer("a.log"), time);
  const std::string otherA = JoinPath(scratch.Root, "a.log");
  // Where a slash is no separator of ours, the base name is the whole path and would lead up.
  const std::string upAfter = kPathSeparator == '/' ? JoinPath(uncopied7, "up.trc") : "../up.trc";
  struct {
    std::string CopyName;
    std::string Log;
    std::string Trace;
    std::string LogAfter;
    std::string TraceAfter;
  } const cases[] = {
      {"C1", "(none)", "", "(none)", ""},
      {"C1", setup, installer("gone"), setup, installer("gone")},
      {"C1", installer("a.log"), otherA, collected("a.log"), otherA},
      {"C1", otherA, installer("b.trc"), otherA, collected("b.trc")},
      {"C1", collected("a.log"), collected("b.trc"), collected("a.log"), collected("b.trc")},
      {"C1", installer("ORXInstallEvent.Log"), "", installer("ORXInstallEvent.Log"), ""},
      {"", "c.log", "../up.trc", JoinPath(uncopied7, "c.log"), upAfter},
      {"(Unknown)", "c.log", "", "c.log", ""},
      {"..", "c.log", "", "c.log", ""},
      {JoinPath("..", ".."), "c.log", "", "c.log", ""},
      {scratch.Root, "c.log", "", "c.log", ""},
  };
  const fs::path before = fs::current_path();
  fs::current_path(setup);
  for (const auto& test : cases) {
    CInstallEvent event("7");
    event.SetCopyName(test.CopyName);
    event.SetLogFileName(test.Log);
    event.SetTraceFile(test.Trace);
    event.CollectFiles();
    EXPECT_EQ(event.GetLogFileName(), test.LogAfter) << test.CopyName;
    EXPECT_EQ(event.GetTraceFile(), test.TraceAfter) << test.CopyName;
  }
  fs::current_path(before);
  EXPECT_EQ(FileText(collected("a.log")), "a.log");
  EXPECT_EQ(fs::last_write_time(collected("a.log")), time);
  EXPECT_EQ(FileText(installer("a.log")), "a.log");
  EXPECT_EQ(FileText(collected("ORXInstallEvent.Log")), "report");
  EXPECT_TRUE(fs::is_empty(JoinPath(scratch.Root, "7")));
}

}  // namespace
