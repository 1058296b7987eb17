// A story: the recorder records a dozen events, between whose start and end known things change on
// the machine. The reader finds these changes in the archive, and nothing else.

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <functional>

#include "app/install_history.h"
#include "reader/check.h"
#include "reader/history.h"
#include "reader/json.h"
#include "tests/reader/change_text.h"
#include "tests/reader/history_of.h"
#include "tests/support/fake_machine.h"
#include "tests/support/file_text.h"
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

void SetProcesses(const std::vector<std::string>& names) {
  static uint32_t next = 100;  // no process has the number of an earlier one
  Machine().ProcessIDs.emplace();
  Machine().Modules.clear();
  for (const std::string& name : names) {
    Machine().ProcessIDs->push_back(next);
    Machine().Modules[next++] = {name};
  }
}

void SetState(size_t service, uint32_t state) {
  Machine().Services.Entries.at(service).CurrentState = state;
}

struct Step {
  std::array<const char*, 3> Call;  // action, copy, result
  std::function<void()> Change;
  std::vector<std::string> Changes;  // as JSON, without the event and the source
};

const std::vector<Step> story = {
    {{"Install", "Prod", "Successful"},
     [] {
       Set(copies + "Prod\\GLOBAL_PROFILE", "LogSize", "4096");
       Set(copies + "Prod\\PROFILES\\ORX", "Port", "50000");
       Set(copies + "Prod\\ORX Server\\CurrentVersion", "Version", "9");
       Set(copies + "Prod\\ORX Server\\CurrentVersion", "ProductCode", "{1}");
       SetSoftware("A", "ORX Server", "9.4");
       Machine().Services.Entries.push_back({"p", "ORX Server - Prod", 1});
     },
     {R"("added","section":"software","path":["ZEK"],"name":"ORX Server","fields":{"version":{"before":null,"after":"9.4"},"date":{"before":null,"after":""},"language":{"before":null,"after":"0"},"location":{"before":null,"after":""}})",
      R"("added","section":"services","path":[],"name":"ORX Server - Prod","fields":{"state":{"before":null,"after":"Stopped"}})",
      R"("added","section":"copies","path":[],"name":"Prod","fields":{})",
      R"("added","section":"products","path":["Prod"],"name":"ORX Server","fields":{"code":{"before":null,"after":"{1}"},"version":{"before":null,"after":"9.."},"service_level":{"before":null,"after":""},"modified":{"before":null,"after":""}})",
      R"("added","section":"profile","path":["Prod"],"name":"LogSize","fields":{"value":{"before":null,"after":"4096"}})",
      R"("added","section":"instances","path":["Prod"],"name":"ORX","fields":{})",
      R"("added","section":"instance_profile","path":["Prod","ORX"],"name":"Port","fields":{"value":{"before":null,"after":"50000"}})"}},
    {{"Start", "Prod", "0"},
     [] { SetState(2, 4); },
     {R"("changed","section":"services","path":[],"name":"ORX Server - Prod","fields":{"state":{"before":"Stopped","after":"Started"}})"}},
    {{"Configure", "Prod", "0"},
     [] { Set(copies + "Prod\\GLOBAL_PROFILE", "LogSize", "8192"); },
     {R"("changed","section":"profile","path":["Prod"],"name":"LogSize","fields":{"value":{"before":"4096","after":"8192"}})"}},
    {{"Configure", "Prod", "1603"},
     [] { Set(copies + "Prod\\PROFILES\\ORX", "Port", "50010"); },
     {R"("changed","section":"instance_profile","path":["Prod","ORX"],"name":"Port","fields":{"value":{"before":"50000","after":"50010"}})"}},
    {{"Start", "Prod", "0"},
     [] {
       SetProcesses({"init", "orxserver", "orxserver", "orxserver", "orxlistener"});
     },
     {R"("changed","section":"processes","path":[],"name":"orxserver","fields":{"count":{"before":"1","after":"3"}})",
      R"("removed","section":"processes","path":[],"name":"editor","fields":{"count":{"before":"1","after":null}})",
      R"("added","section":"processes","path":[],"name":"orxlistener","fields":{"count":{"before":null,"after":"1"}})"}},
    {{"Configure", "Prod", "0"},
     [] {
       Machine().LocalGroups[0].second = {"H\\ana"};
       Machine().LocalGroups.push_back({"orx operators", {"H\\bob"}});
       Machine().DomainUser = "H\\bob";
     },
     {R"("removed","section":"user","path":[],"name":"H\\ana","fields":{})",
      R"("added","section":"user","path":[],"name":"H\\bob","fields":{})",
      R"("added","section":"groups","path":[],"name":"orx operators","fields":{})",
      R"("removed","section":"members","path":["Administrators"],"name":"H\\bob","fields":{})",
      R"("added","section":"members","path":["orx operators"],"name":"H\\bob","fields":{})"}},
    {{"Install", "Prod", "0"},
     [] {
       Set(drivers + "ODBC Drivers", "ZEK ORX", "Installed");
       Set(drivers + "ZEK ORX", "Driver", "C:\\ZEK\\orx.dll");
     },
     {R"("added","section":"drivers","path":[],"name":"ZEK ORX","fields":{})",
      R"("added","section":"driver_parameters","path":["ZEK ORX"],"name":"Driver","fields":{"value":{"before":null,"after":"C:\\ZEK\\orx.dll"}})"}},
    {{"Upgrade", "Prod", "Successful"},
     [] {
       SetSoftware("A", "ORX Server", "9.5");
       Remove(software + "T");
       Set(copies + "Prod\\ORX Server\\CurrentVersion", "Version", "10");
     },
     {R"("changed","section":"software","path":["ZEK"],"name":"ORX Server","fields":{"version":{"before":"9.4","after":"9.5"}})",
      R"("removed","section":"software","path":["ZEK"],"name":"Tools","fields":{"version":{"before":"1.0","after":null},"date":{"before":"","after":null},"language":{"before":"0","after":null},"location":{"before":"","after":null}})",
      R"("changed","section":"products","path":["Prod"],"name":"ORX Server","fields":{"version":{"before":"9..","after":"10.."}})"}},
    {{"Install", "Test", "0"},
     [] { Set(copies + "Test", "", ""); },
     {R"("added","section":"copies","path":[],"name":"Test","fields":{})"}},
    {{"Verify", "Test", "Nothing to do"},
     [] {
       SetProcesses({"orxserver", "init", "orxserver", "orxserver", "orxlistener"});
     },
     {}},
    // Of two services with one name one stops: which, nobody can see.
    {{"Stop", "Test", "Failed (1603), rolled back"},
     [] { SetState(0, 1); },
     {R"("changed","section":"services","path":[],"name":"ORX Listener","fields":{"state":{"before":"Started","after":"Stopped"}})"}},
    {{"Remove", "Test", "0"},
     [] { Remove(copies + "Test"); },
     {R"("removed","section":"copies","path":[],"name":"Test","fields":{})"}},
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
  SetProcesses({"init", "orxserver", "editor"});
}

TEST(Story, ReadsBackWhatWasDoneAndNothingElse) {
  const ScratchHistory scratch;
  SetMachine();
  std::string identity = "1000";
  for (const auto& [call, change, changes] : story) {
    const auto& [action, copy, result] = call;
    RunTool({"-start", identity, "-Action", action, "-Type", "Silent"});
    RunTool({"-logmessage", identity, "-message", std::string("Message of ") + action});
    change();
    RunTool({"-end", identity, "-CopyName", copy, "-Result", result});
    identity = std::to_string(std::stoi(identity) + 1);
  }
  const std::string archive = scratch.In("story.zip");
  ASSERT_EQ(CInstallHistory().Report(archive), 1);

  const HistoryOf history(archive);
  ASSERT_EQ(history.Result.Events.size(), story.size());
  for (size_t i = 0; i < story.size(); ++i) {
    const Event& event = history.Result.Events[i];
    EXPECT_EQ(event.Identity, std::to_string(1000 + i));
    std::vector<std::string> changes;
    for (const Change& change : event.Differences.List) {
      const std::string json = ChangeJson("story.zip", event, change);
      const std::string begin = R"({"event":")" + event.Identity + R"(","change":)";
      EXPECT_TRUE(json.starts_with(begin) && json.ends_with(R"(,"source":"story.zip"})")) << json;
      changes.push_back(json.substr(begin.size(), json.rfind(',') - begin.size()));
    }
    EXPECT_EQ(changes, story[i].Changes);
    EXPECT_EQ(event.Messages, std::string("Message of ") + story[i].Call[0] + '\n');
    EXPECT_EQ(event.Computer, "ORXHOST");
    const auto& compared = event.Differences.Compared;
    EXPECT_EQ(std::count(compared.begin(), compared.end(), false), 0);
  }
  EXPECT_TRUE(history.From->Findings.empty());
  for (const Finding& finding : CheckHistory(history.Result)) {
    ADD_FAILURE() << finding.Code << ' ' << finding.Event << ' ' << finding.Text;
  }
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
  const std::vector<std::string> changes = {
      "added services ORX Server|state - > Stopped",
      "changed instance_profile Prod/ORX/Port|value 50000 > 50010"};
  EXPECT_EQ(ChangeTexts(history.Result.Events.at(0).Differences), changes);
}

}  // namespace
