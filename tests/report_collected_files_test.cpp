#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "app/install_event.h"
#include "history/locations.h"
#include "platform/path.h"
#include "tests/fake_machine.h"

namespace {

namespace fs = std::filesystem;

class CollectedFiles : public testing::Test {
 protected:
  void SetUp() override {
    fs::create_directories(EventFolder());
    fs::create_directories(Installer("again"));
    for (const char* name : {"setup.log", "setup.trc", "setup.rsp", "ORXInstallEvent.Log"}) {
      WriteFileText(Installer(name), std::string("installer's ") + name);
    }
    WriteFileText(JoinPath(Installer("again"), "setup.log"), "second");
    WriteFileText(Collected("ORXInstallEvent.Log"), "report");
    WriteFileText(Collected("there.log"), "collected");
  }

  static std::string EventFolder() { return JoinPath(JoinPath(GetHistoryDir(), "C1"), "7"); }
  static std::string Collected(const std::string& name) { return JoinPath(EventFolder(), name); }
  std::string Installer(const std::string& name) const {
    return JoinPath(JoinPath(Scratch.Root, "installer"), name);
  }

  static CInstallEvent Event(const std::string& copyName, const std::string& log,
                             const std::string& trace, const std::string& response) {
    CInstallEvent event("7");
    event.SetCopyName(copyName);
    event.SetLogFileName(log);
    event.SetTraceFile(trace);
    event.SetResponseFile(response);
    return event;
  }

  const ScratchHistory Scratch;
};

TEST_F(CollectedFiles, LieInTheFolderOfTheirEvent) {
  const fs::file_time_type time =
      fs::last_write_time(Installer("setup.log")) - std::chrono::hours(5);
  fs::last_write_time(Installer("setup.log"), time);
  CInstallEvent event =
      Event("C1", Installer("setup.log"), Installer("setup.trc"), Installer("setup.rsp"));
  for (int report = 0; report < 2; ++report) {
    event.CollectFiles();
    EXPECT_EQ(event.GetLogFileName(), Collected("setup.log"));
    EXPECT_EQ(event.GetTraceFile(), Collected("setup.trc"));
    EXPECT_EQ(event.GetResponseFile(), Collected("setup.rsp"));
    EXPECT_EQ(FileText(Collected("setup.rsp")), "installer's setup.rsp");
    EXPECT_EQ(FileText(Installer("setup.rsp")), "installer's setup.rsp");
    EXPECT_EQ(fs::last_write_time(Collected("setup.log")), time);
  }
}

TEST_F(CollectedFiles, AreLeftWhereTheyCannotBeTaken) {
  struct {
    std::string CopyName;
    std::string Log;
    std::string Trace;
    std::string LogAfter;
    std::string TraceAfter;
  } const cases[] = {
      {"C1", "(none)", "", "(none)", ""},
      {"C1", Installer("again"), Installer("gone.trc"), Installer("again"), Installer("gone.trc")},
      {"C1", Installer("ORXInstallEvent.Log"), Collected("there.log"),
       Installer("ORXInstallEvent.Log"), Collected("there.log")},
      {"C1", Installer("setup.log"), JoinPath(Installer("again"), "setup.log"),
       Collected("setup.log"), JoinPath(Installer("again"), "setup.log")},
      {"C1", Installer("setup.log"), Installer("setup.trc"), Installer("setup.log"),
       Collected("setup.trc")},
      {"(Unknown)", Installer("setup.log"), "", Installer("setup.log"), ""},
      {"..", Installer("setup.log"), "", Installer("setup.log"), ""},
      {Scratch.Root, Installer("setup.log"), "", Installer("setup.log"), ""},
  };
  fs::create_directory(JoinPath(Scratch.Root, "7"));
  fs::create_directory(JoinPath(JoinPath(Scratch.Root, "ZEK"), "7"));
  for (const auto& test : cases) {
    CInstallEvent event = Event(test.CopyName, test.Log, test.Trace, "");
    event.CollectFiles();
    EXPECT_EQ(event.GetLogFileName(), test.LogAfter) << test.CopyName;
    EXPECT_EQ(event.GetTraceFile(), test.TraceAfter) << test.CopyName;
  }
  EXPECT_EQ(FileText(Collected("ORXInstallEvent.Log")), "report");
  EXPECT_EQ(FileText(Collected("setup.log")), "installer's setup.log");
  EXPECT_TRUE(fs::is_empty(JoinPath(Scratch.Root, "7")));
  EXPECT_TRUE(fs::is_empty(JoinPath(JoinPath(Scratch.Root, "ZEK"), "7")));
}

TEST_F(CollectedFiles, AreFoundInTheWorkingDirectory) {
  const fs::path before = fs::current_path();
  fs::current_path(Installer("again"));
  fs::create_directory(JoinPath(GetHistoryDir(), "7"));
  CInstallEvent event = Event("", "setup.log", "../setup.trc", "");
  event.CollectFiles();
  fs::current_path(before);
  const std::string folder = JoinPath(GetHistoryDir(), "7");
  EXPECT_EQ(event.GetLogFileName(), JoinPath(folder, "setup.log"));
  EXPECT_EQ(FileText(JoinPath(folder, "setup.log")), "second");
  // Where a slash is no separator of ours, the base name is the whole path and would lead up.
  EXPECT_EQ(event.GetTraceFile(),
            kPathSeparator == '/' ? JoinPath(folder, "setup.trc") : "../setup.trc");
}

}  // namespace
