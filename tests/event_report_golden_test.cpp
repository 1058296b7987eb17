// A whole ORXInstallEvent.Log, compared with the golden one, and the adjustment that its tables
// carry from one to the next.

#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <regex>

#include "history/locations.h"
#include "inventory/process_list.h"
#include "inventory/service_list.h"
#include "inventory/software_list.h"
#include "inventory/user_list.h"
#include "products/copy_generation.h"
#include "products/odbc_drivers.h"
#include "products/products_list.h"
#include "tests/fake_machine.h"

namespace {

using Texts = std::vector<std::pair<std::string, std::string>>;

void SetTexts(const std::string& keyPath, const Texts& values) {
  Machine().SetKey(keyPath);
  for (const auto& [name, text] : values) {
    Machine().SetText(keyPath, name, text);
  }
}

void SetSystem(uint8_t productType) {
  SystemVersion version;
  version.PlatformID = 2;
  version.MajorVersion = 5;
  version.MinorVersion = 2;
  version.ServicePack = "Service Pack 1";
  version.ProductType = productType;
  Machine().ComputerName = "ORXHOST";
  Machine().ExtendedVersion = version;
  Machine().System = {9, 4, 8664, 6};
}

void SetAccounts() {
  Machine().DomainUser = "ORXHOST\\installer";
  Machine().LocalGroups = {{"Administrators", {"ORXHOST\\installer", "ORXHOST\\operator"}},
                           {"Guests", {}},
                           {"A group name of thirty letters", {"ORXHOST\\ana"}},
                           {"A group name of more than thirty", {"ORXHOST\\ana"}},
                           {"Benutzer für Übungen", {"ORXHOST\\jörg"}}};
  Machine().GlobalGroups = {{"Domain Users", {"ana", "operator"}}, {"Domain Guests", {}}};
}

void SetSoftware() {
  const std::string root =
      "SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Products\\";
  const std::string properties = "\\InstallProperties";
  SetTexts(root + "P1" + properties, {{"DisplayName", "ORX Server"},
                                      {"DisplayVersion", "9.4.1907"},
                                      {"InstallDate", "20261101"},
                                      {"InstallLocation", "C:\\ZEK\\ORX\\"},
                                      {"Language", "1033"},
                                      {"Publisher", "ZEK"}});
  SetTexts(root + "P2" + properties, {{"DisplayName", "Not of interest"}, {"Publisher", "Other"}});
  SetTexts(root + "P3", {});
  SetTexts(root + "P4" + properties,
           {{"DisplayName", "Tools whose name is longer than the sixty-five columns of its field"},
            {"DisplayVersion", "12345678901234567890"},
            {"InstallDate", "20261102"},
            {"Language", "-1"},
            {"Publisher", "A maker of Microsoft add-ons (30)"}});
  SetTexts(root + "P5" + properties, {{"DisplayName", "Wörterbuch"},
                                      {"InstallLocation", "D:\\Wörter"},
                                      {"Publisher", "Orrin Software"}});
}

void SetServices() {
  Machine().Services.Entries = {
      {"ORXSRV", "ORX Server", 4},
      {"orxlow", "orx in small letters", 4},
      {"msiserver", "Windows Installer", 1},
      {"ORXPAUSE", "ORX Agent", 7},
      {"ORXLONG", "ORX service with a display name of exactly sixty letters, 60", 2},
      {"ORXODD", "ORX Watch", 9}};
}

void SetProcesses() {
  Machine().OwnProcess = 77;
  Machine().ProcessIDs = {{0, 4, 77, 1234567890, 5}};
  Machine().Modules = {{4, {""}}, {77, {"ORXInstallEventLog.exe"}}, {1234567890, {"setup.exe"}}};
}

void SetCopy(const std::string& copyKey, const std::string& productCode) {
  SetTexts(copyKey + "\\CurrentVersion", {{"Version", "9"}});
  SetTexts(copyKey + "\\GLOBAL_PROFILE", {{"DefaultInstance", "ORX1"},
                                          {"A_PROFILE_NAME_OF_29_LETTERS_", "fits"},
                                          {"A_PROFILE_NAME_THAT_DOES_NOT_FIT", "whole"}});
  Machine().SetNumber(copyKey + "\\GLOBAL_PROFILE", "Limit", 0xFFFFFFFE);
  SetTexts(copyKey + "\\PROFILES\\ORX1",
           {{"Folder", "C:\\ZEK"}, {"A_PARAMETER_NAME_OF_EXACTLY_36_BYTES", "run in"}});
  Machine().SetData(copyKey + "\\PROFILES\\ORX1", "Blob", {3, "blob"});
  SetTexts(copyKey + "\\PROFILES\\ORX2", {});
  SetTexts(copyKey + "\\ADM_PROFILES\\ADM1", {{"not", "shown"}});
  SetTexts(copyKey + "\\ORX Server\\CurrentVersion", {{"Version", "9"},
                                                      {"Release", "4"},
                                                      {"Modification", "0"},
                                                      {"Service Level", "Service Level 3"},
                                                      {"ProductCode", productCode},
                                                      {"Last Modified Date", "20261101"},
                                                      {"Title", "not shown"}});
  SetTexts(copyKey + "\\ORX Client", {});
  SetTexts(copyKey + "\\Tools", {});
}

void SetDrivers() {
  const std::string catalogue = "SOFTWARE\\ODBC\\ODBCINST.INI\\";
  SetTexts(catalogue + "ODBC Drivers", {{"ZEK ORX ODBC DRIVER", "Installed"},
                                        {"Other driver", "Installed"},
                                        {"My ZEK ORX DRIVER - C1", "Installed"}});
  SetTexts(catalogue + "ZEK ORX ODBC DRIVER",
           {{"Driver", "C:\\ZEK\\orxodbc.dll"}, {"A_PARAMETER_NAME_OF_30_LETTERS", "run in"}});
  Machine().SetNumber(catalogue + "ZEK ORX ODBC DRIVER", "UsageCount", 2);
}

// The lines of a file, whatever ends them on this system, with a mark in place of each time stamp:
// these are all that differs between two runs over the same machine.
std::string Report(const std::string& path) {
  std::ifstream file(path);
  const std::string text(std::istreambuf_iterator<char>(file), {});
  return std::regex_replace(text, std::regex("[0-9]{8} [0-9]{2}:[0-9]{2}:[0-9]{2}"), "<time>");
}

TEST(EventReport, IsTheGoldenOne) {
  const ScratchHistory scratch;
  SetSystem(/*productType=*/2);
  SetAccounts();
  SetSoftware();
  SetServices();
  SetProcesses();
  SetCopy("SOFTWARE\\ZEK\\ORX", "{0000-0001}");
  EXPECT_EQ(RunTool({"-start", "42", "-Product", "ORX Server Build 1907", "-ServiceLevel",
                     "Service Level 3", "-Action", "Install", "-Type", "GUI", "-Command",
                     "setup.exe /gui", "-l", "C:\\Temp\\orx.log"}),
            0);
  EXPECT_EQ(RunTool({"-logmessage", "42", "-message", "Copying files"}), 0);

  // What the installer has changed; and the machine is no domain controller any more.
  SetSystem(/*productType=*/3);
  SetTexts("SOFTWARE\\ZEK\\ORX\\InstalledCopies\\Empty", {});
  SetCopy("SOFTWARE\\ZEK\\ORX\\InstalledCopies\\C1",
          "{0000-0002 of more than forty characters all}");
  SetDrivers();
  Machine().Services = {5, {}};
  Machine().ProcessIDs.reset();
  EXPECT_EQ(
      RunTool({"-end", "42", "-Result", "Successful", "-CopyName", "C1", "-Action", "Update"}), 0);

  const std::string folder = JoinPath(JoinPath(GetHistoryDir(), "C1"), "42");
  const std::string golden = Report(JoinPath(ORX_GOLDEN_FOLDER, "ORXInstallEvent.Log"));
  EXPECT_FALSE(golden.empty());
  EXPECT_EQ(Report(JoinPath(folder, "ORXInstallEvent.Log")), golden);
}

// One row of each table that sets a width and no adjustment.
void PrintUnadjustedTables() {
  CProcessList processes;
  processes.Processes = {{"a.exe", 7}};
  processes.Print();
  CORXCopy copy("C1");
  copy.GlobalProfile = {{"G", "global"}};
  copy.Instances = {{"C1", "I1"}};
  copy.Instances[0].Parameters = {{"I", "instance"}};
  copy.AddProduct({"C1", "ORX Server"});
  copy.Print();
  CODBCDriversList drivers;
  drivers.Drivers.emplace_back("D");
  drivers.Drivers[0].Parameters = {{"P", "driver"}};
  drivers.Print();
}

TEST(EventReport, PadsOnTheLeftUntilARowTurnsLeftAdjustmentOn) {
  CUsersList group;
  group.LocalGroups = {"Users"};
  CUsersList member;
  member.LocalMembers = {{"HOST\\ana", "Users"}};
  CProductsList otherSoftware;
  otherSoftware.Products.resize(1);
  CProductsList software = otherSoftware;
  software.Products[0].Publisher = "ZEK";
  CServicesList otherService;
  otherService.Services = {{"a", "b", "Started"}};
  CServicesList service;
  service.Services = {{"a", "ORX", "Started"}};
  const std::pair<Info*, bool> cases[] = {
      {&group, false},   {&member, true},        {&otherSoftware, false},
      {&software, true}, {&otherService, false}, {&service, true},
  };
  Machine() = FakeMachine();
  for (const auto& [before, isLeft] : cases) {
    const std::string text = LoggedText([list = before] {
      list->Print();
      PrintUnadjustedTables();
    });
    const auto padded = [isLeft = isLeft](const std::string& value, size_t width) {
      const std::string blanks(width - value.size(), ' ');
      return isLeft ? value + blanks : blanks + value;
    };
    const std::string rows[] = {padded("7", 19) + "a.exe", padded("G:", 30) + "global",
                                padded("ORX Server", 40) + padded("", 40) + padded("..", 10) +
                                    padded("", 20) + padded("", 20),
                                padded("I", 36) + "instance", padded("P", 30) + "driver"};
    for (const std::string& row : rows) {
      EXPECT_NE(text.find('\n' + row + '\n'), std::string::npos) << row << '\n' << text;
    }
  }
}

}  // namespace
