// A story: the recorder records a dozen events, between whose start and end known things change on
// the machine. The reader finds these changes in the archive, and nothing else.

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <functional>

#include "app/install_history.h"
#include "reader/event_text.h"
#include "reader/json.h"
#include "reader/views.h"
#include "tests/reader/history_text.h"
#include "tests/support/fake_machine.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

namespace {

const std::string copies = "SOFTWARE\\ZEK\\ORX\\InstalledCopies\\";
const std::string drivers = "SOFTWARE\\ODBC\\ODBCINST.INI\\";
const std::string software =
    "SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Products\\";

void Remove(const std::string& key, const std::string& name = "") {
  std::erase_if(Machine().Registry, [&](const FakeMachine::RegistryEntry& entry) {
    return entry.KeyPath.starts_with(key) && (name.empty() || entry.ValueName == name);
  });
}

void Set(const std::string& key, const std::string& name, const std::string& value) {
  Remove(key, name);
  Machine().SetText(key, name, value);
}

void SetSoftware(const std::string& key, const std::string& name, const std::string& version) {
  Set(software + key + "\\InstallProperties", "DisplayName", name);
  Set(software + key + "\\InstallProperties", "DisplayVersion", version);
  Set(software + key + "\\InstallProperties", "Publisher", "ZEK");
}

void SetProcesses(const std::string& names) {
  static uint32_t next = 100;  // no process has the number of an earlier one
  Machine().ProcessIDs.emplace();
  Machine().Modules.clear();
  std::istringstream words(names);
  for (std::string name; words >> name;) {
    Machine().ProcessIDs->push_back(next);
    Machine().Modules[next++] = {name};
  }
}

struct Step {
  std::array<const char*, 3> Call;  // action, copy, result
  std::function<void()> Change;
};

const std::vector<Step> story = {
    {{"Install", "Prod", "Successful"},
     [] {
       Set(copies + "Prod\\GLOBAL_PROFILE", "LogSize", "4096");
       Set(copies + "Prod\\PROFILES\\ORX", "Port", "50000");
       Set(copies + "Prod\\PROFILES\\ORX", "Old", "1");
       Set(copies + "Prod\\PROFILES\\TEST", "Port", "50000");
       Set(copies + "Prod\\ORX Server\\CurrentVersion", "Version", "9");
       Set(copies + "Prod\\ORX Server\\CurrentVersion", "ProductCode", "{1}");
       SetSoftware("A", "ORX Server", "9.4");
       Machine().Services.Entries.push_back({"p", "ORX Server - Prod", 1});
     }},
    {{"Start", "Prod", "0"}, [] { Machine().Services.Entries[2].CurrentState = 4; }},
    {{"Configure", "Prod", "0"}, [] { Set(copies + "Prod\\GLOBAL_PROFILE", "LogSize", "8192"); }},
    {{"Configure", "Prod", "1603"},
     [] {
       Set(copies + "Prod\\PROFILES\\ORX", "Port", "50010");
       Remove(copies + "Prod\\PROFILES\\ORX", "Old");
       Set(copies + "Prod\\PROFILES\\TEST", "Port", "50010");
       Set("SOFTWARE\\ZEK\\ORX\\GLOBAL_PROFILE", "Old", "1");
     }},
    {{"Start", "Prod", "0"},
     [] { SetProcesses("init orxserver orxserver orxserver orxlistener"); }},
    {{"Configure", "Prod", "0"},
     [] {
       Machine().LocalGroups[0].second = {"H\\ana"};
       Machine().LocalGroups.push_back({"orx operators", {"H\\bob"}});
       Machine().DomainUser = "H\\bob";
     }},
    {{"Install", "Prod", "0"},
     [] {
       Set(drivers + "ODBC Drivers", "ZEK ORX", "Installed");
       Set(drivers + "ZEK ORX", "Driver", "C:\\ZEK\\orx.dll");
       SetProcesses("init orxserver orxserver orxserver orxlistener svchost.exe");
     }},
    {{"Upgrade", "Prod", "Successful"},
     [] {
       SetSoftware("A", "ORX Server", "9.5");
       SetSoftware("B", "A name that fills the whole column", "1.0");
       SetSoftware("C", "A name that is longer than a column", "1.0");
       Remove(software + "T");
       Set(copies + "Prod\\ORX Server\\CurrentVersion", "Version", "10");
     }},
    {{"Install", "Test", "0"}, [] { Set(copies + "Test", "", ""); }},
    {{"Verify", "Test", "Nothing to do"},
     [] { SetProcesses("orxserver svchost.exe init orxserver orxserver orxlistener"); }},
    // Of two services with one name one stops: which, nobody can see.
    {{"Stop", "Test", "Failed (1603), rolled back"},
     [] { Machine().Services.Entries[0].CurrentState = 1; }},
    {{"Remove", "Test", "0"}, [] { Remove(copies + "Test"); }},
};

void SetMachine() {
  Machine().ComputerName = "ORXHOST";
  Machine().ExtendedVersion = SystemVersion{5, 2, 3790, 2, "", 1, 0, 0, 3};
  Machine().DomainUser = "H\\ana";
  Machine().LocalGroups = {{"Administrators", {"H\\ana", "H\\bob"}}};
  Machine().Services.Entries = {{"a", "ORX Listener", 4}, {"b", "ORX Listener", 4}};
  SetSoftware("T", "Tools", "1.0");
  // The key above the copies, which the recorder lists as a copy prior to V9.
  Set("SOFTWARE\\ZEK\\ORX", "", "");
  SetProcesses("init orxserver editor");
}

TEST(Story, ReadsBackWhatWasDoneAndNothingElse) {
  const ScratchHistory scratch;
  SetMachine();
  int identity = 1000;
  for (const auto& [call, change] : story) {
    const auto& [action, copy, result] = call;
    const std::string event = std::to_string(identity++);
    RunTool({"-start", event, "-Action", action, "-Type", "Silent"});
    RunTool({"-logmessage", event, "-message", std::string("Message of ") + action});
    change();
    RunTool({"-end", event, "-CopyName", copy, "-Result", result});
  }
  const std::string archive = scratch.In("story.zip");
  ASSERT_EQ(CInstallHistory().Report(archive), 1);

  const HistoryOf history(archive);
  ASSERT_EQ(history.Result.Events.size(), story.size());
  std::string changes;
  std::string shown;
  for (size_t i = 0; i < story.size(); ++i) {
    const Event& event = history.Result.Events[i];
    for (const Change& change : event.Differences.List) {
      changes += ChangeJson("story.zip", event, change) + '\n';
    }
    shown += TitleOf(event) + '\n' + DifferencesText(event, {}) + '\n';
    EXPECT_EQ(event.Messages, std::string("Message of ") + story[i].Call[0] + '\n');
    EXPECT_EQ(event.Computer, "ORXHOST");
  }
  EXPECT_EQ(changes, Golden("story_changes.txt"));
  EXPECT_EQ(shown, Golden("story_shown.txt"));
  EXPECT_EQ(history.Findings(), "");
}

// Before the first row of users, software or services a run pads on the left.
TEST(Story, ReadsBothAdjustments) {
  const ScratchHistory scratch;
  story[0].Change();
  Machine().Services.Entries.clear();
  Remove(software);
  RunTool({"-start", "1"});
  Set(copies + "Prod\\PROFILES\\ORX", "Port", "50010");
  Machine().Services.Entries = {{"p", "ORX Server", 1}};
  RunTool({"-end", "1"});
  const HistoryOf history(scratch.In("ZEK/ORXHistory"));
  EXPECT_EQ(ChangeLines(history.Result.Events.at(0).Differences),
            "added services ORX Server|state - > Stopped\n"
            "changed instance_profile Prod/ORX/Port|value 50000 > 50010\n");
}

}  // namespace
