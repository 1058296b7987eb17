// Whole event reports, compared with the golden ones.

#include <gtest/gtest.h>

#include <iomanip>

#include "eventlog/logger.h"
#include "inventory/service_list.h"
#include "inventory/software_list.h"
#include "tests/support/fake_machine.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

namespace {

// The report of an event as it is in the golden files.
std::string Report(const std::string& path) {
  return WithoutTimes(Replaced(FileText(InHistory(path + "/ORXInstallEvent.Log")), "\r\n", "\n"));
}

void SetSystem(uint8_t productType) {
  Machine().ComputerName = "ORXHOST";
  Machine().ExtendedVersion = SystemVersion{5, 2, 3790, 2, "Service Pack 1", 1, 0, 0, productType};
  Machine().System = {9, 4, 8664, 6};
}

void SetMachine() {
  SetSystem(/*productType=*/2);
  Machine().DomainUser = "ORXHOST\\installer";
  Machine().WorkstationUser = "not asked for";
  Machine().LocalGroups = {{"Administrators", {"ORXHOST\\installer", "ORXHOST\\operator"}},
                           {"Guests", {}},
                           {"A group name of thirty letters", {"ORXHOST\\ana"}},
                           {"A group name of more than thirty", {"ORXHOST\\ana"}},
                           {"Benutzer für Übungen", {"ORXHOST\\jörg"}}};
  Machine().GlobalGroups = {{"Domain Users", {"ana", "operator"}}, {"Domain Guests", {}}};
  Machine().OwnProcess = 77;
  Machine().ProcessIDs = {{0, 4, 77, 1234567890, 5}};
  Machine().Modules = {{4, {""}}, {77, {"ORXInstallEventLog.exe"}}, {1234567890, {"setup.exe"}}};
  Machine().Services.Entries = {
      {"a", "ORX service with a display name of exactly sixty letters, 60", 1},
      {"b", "A Windows Installer", 4},
      {"ORX", "orx in small letters", 4},
      {"ORX", "windows installer", 4},
      {"ORX", "Windows Updater", 4}};
  for (uint32_t state = 0; state < 9; ++state) {
    Machine().Services.Entries.push_back({"c", "The ORX service", state});
  }
  Machine().Load(Golden("registry_before.txt"));
}

TEST(EventReport, IsTheGoldenOne) {
  const ScratchHistory scratch;
  SetMachine();
  EXPECT_EQ(RunTool({"-start", "42", "-Product", "ORX Server Build 1907", "-ServiceLevel",
                     "Service Level 3", "-Action", "Install", "-Type", "GUI", "-Command",
                     "setup.exe /gui", "-l", "C:\\Temp\\orx.log"}),
            0);
  EXPECT_EQ(RunTool({"-logmessage", "42", "-message", "Copying files"}), 0);

  // What the installer has changed; and the machine is no domain controller any more.
  SetSystem(/*productType=*/3);
  Machine().Load(Golden("registry_added.txt"));
  Machine().Services = {5, {}};
  Machine().ProcessIDs.reset();
  EXPECT_EQ(
      RunTool({"-end", "42", "-Result", "Successful", "-CopyName", "C1", "-Action", "Update"}), 0);
  EXPECT_EQ(Report("C1/42"), Golden("ORXInstallEvent.Log"));
}

// The rows of the user, software and service tables turn left adjustment on for all that follows.
// Without one of them, which this machine has none of, values are padded on the left.
TEST(EventReport, PadsOnTheLeftUntilARowTurnsLeftAdjustmentOn) {
  const ScratchHistory scratch;
  Machine().WorkstationUser = "ana";
  Machine().LocalGroups = {{"Guests", {}}};
  Machine().ProcessIDs = {{7}};
  Machine().Modules = {{7, {"setup.exe"}}};
  Machine().Services.Entries = {{"ORX", "Not of interest", 4}};
  Machine().Load(Golden("registry_added.txt"));
  EXPECT_EQ(RunTool({"-start", "1"}), 0);
  EXPECT_EQ(Report("1"), Golden("ORXInstallEvent_unadjusted.Log"));

  CProductsList software;
  software.Products.emplace_back().Publisher = "ZEK";
  CServicesList services;
  services.Services = {{"a", "ORX", "Started"}};
  for (Info* list : std::initializer_list<Info*>{&software, &services}) {
    const std::string text = LoggedText([list] {
      list->Print();
      CLogger::GetInstance() << std::setw(3) << 'x';
    });
    EXPECT_EQ(text.substr(text.size() - 3), "x  ");
  }
}

}  // namespace
