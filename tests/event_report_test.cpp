// Complete event reports, and what is collected of a machine and they do not show.

#include <gtest/gtest.h>

#include <iomanip>
#include <sstream>

#include "eventlog/logger.h"
#include "inventory/computer_info.h"
#include "inventory/process_list.h"
#include "inventory/service_list.h"
#include "inventory/software_list.h"
#include "inventory/user_list.h"
#include "platform/path.h"
#include "products/copy_generation.h"
#include "products/products_list.h"
#include "products/registry_value.h"
#include "tests/support/fake_machine.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

namespace {

using namespace std::string_literals;

// The report of an event as it is in the golden files.
std::string Report(const std::string& path) {
  return WithoutTimes(Replaced(FileText(InHistory(path + "/ORXInstallEvent.Log")), "\r\n", "\n"));
}

void SetSystem(uint8_t productType) {
  Machine().ComputerName = "ORXHOST";
  Machine().ExtendedVersion = SystemVersion{5, 2, 3790, 2, "Service Pack 1", 1, 0, 0, productType};
  Machine().System = {9, 4, 8664, 6};
}

void SetServer() {
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
  SetServer();
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

// The machine that the first columns of a line of the golden table describe. A registry text
// instead of the product type is for a system that knows only the short version.
void SetMachine(const std::string& line) {
  Machine() = FakeMachine();
  SystemVersion version;
  SystemInfo& system = Machine().System;
  std::string product;
  std::istringstream columns(line);
  columns >> version.PlatformID >> version.MajorVersion >> version.MinorVersion >> product;
  columns >> std::hex >> version.SuiteMask >> std::dec;
  columns >> system.ProcessorArchitecture >> system.ProcessorLevel >> system.ProcessorType;
  const bool isExtended = product.size() == 1;
  if (isExtended) {
    version.ProductType = static_cast<uint8_t>(product[0] - '0');
  }
  (isExtended ? Machine().ExtendedVersion : Machine().ShortVersion) = version;
  Machine().SetText("SYSTEM\\CurrentControlSet\\Control\\ProductOptions", "ProductType",
                    isExtended ? "WINNT" : product);
}

TEST(Computer, IsThatOfTheGoldenTable) {
  std::istringstream lines(Golden("computers.txt"));
  std::string line;
  ASSERT_TRUE(std::getline(lines, line));  // names the columns
  while (std::getline(lines, line)) {
    SetMachine(line);
    CComputerInfo computer;
    EXPECT_EQ(computer.Collect(), 0);
    EXPECT_EQ(computer.IsDomainController, computer.Type == "Domain Controller") << line;
    const std::string family = IsWindowsNTFamily() ? "|NT|" : "|95|";
    EXPECT_EQ('|' + computer.OSName + '|' + computer.Type + family + computer.CPU + '|',
              line.substr(line.find('|')));
  }
  // A text of 80 bytes with its terminator is the longest; the key is opened for queries alone.
  SetMachine("2 4 0 WINNT 0 0 0 0");
  CComputerInfo().Collect();
  EXPECT_EQ(Machine().RegistryQuestions.at(0),
            "SYSTEM\\CurrentControlSet\\Control\\ProductOptions|ProductType|80|1");
}

TEST(Lists, ReadTextsAndNumbersAndNothingElse) {
  const std::vector<std::pair<RegistryData, std::string>> cases = {
      {{kRegistryText, "no zero"}, "no zero"},
      {{kRegistryText, "first\0second\0"s}, "first"},
      {{kRegistryText, std::string(99, 'x') + '\0'}, std::string(99, 'x')},
      {{kRegistryText, std::string(100, 'x') + '\0'}, ""},
      {{kRegistryText, "\0"s}, ""},
      {{kRegistryNumber, "\0\0\0\0"s}, "0"},
      {{kRegistryNumber, "\x09\x04\0\0"s}, "1033"},
      {{kRegistryNumber, "\xFF\xFF\xFF\xFF"}, "-1"},
      {{kRegistryNumber, "\0\0\0\x80"s}, "-2147483648"},
      {{kRegistryNumber, "\x01\x02"}, ""},
      {{kRegistryNumber, "\x01\0\0\0\0\0\0\0"s}, ""},
      {{2, "%PATH%\0"s}, ""},
      {{3, "\x01\x02\x03\x04"}, ""}};
  for (const auto& [data, text] : cases) {
    Machine() = FakeMachine();
    Machine().Registry = {{"SOFTWARE\\ZEK", "Value", data}};
    EXPECT_EQ(ReadRegistryValue("SOFTWARE\\ZEK", "Value"), text);
    EXPECT_EQ(ReadRegistryValue("SOFTWARE\\ZEK", "Missing"), "");
    // 0x2001B: to read, and to set values.
    EXPECT_EQ(Machine().RegistryQuestions.at(0), "SOFTWARE\\ZEK|Value|100|131099");
  }
}

// Control characters can neither add a line nor reach a terminal. A letter of a code page stays.
TEST(Lists, ShowControlCharactersAsQuestionMarksAndForgetWhatIsGone) {
  const std::string name = "ORX\n1) \r\t\0\x1B[2J\x7F|\xC2\x85\xC2\x9F|\xC2\xA0\x80\x9F\xC3\x9F~"s;
  // Where these bytes begin two-byte characters, they are letters.
  const std::string controls = IsLeadByte('\x85') ? "\xC2\x85\xC2\x9F" : "??";
  const std::string shown = "ORX?1) ????[2J?|" + controls + "|\xC2\xA0\x80\x9F\xC3\x9F~";
  Machine() = FakeMachine();
  CUsersList users;
  CProcessList processes;
  CServicesList services;
  const auto printed = [&] {
    return LoggedText([&] {
      for (Info* list : std::initializer_list<Info*>{&users, &processes, &services}) {
        list->Collect();
        list->Print();
      }
    });
  };
  Machine().DomainUser = name;
  Machine().LocalGroups = {{name, {name}}};
  Machine().ProcessIDs = {{9}};
  Machine().Modules = {{9, {name}}};
  Machine().Services.Entries = {{name, name, 1}};
  const std::string before = printed();
  Machine() = FakeMachine();
  Machine().WorkstationUser = "ana";
  const std::string after = printed();
  const auto padded = [&shown](size_t width) {
    return shown + std::string(width - shown.size(), ' ');
  };
  for (const std::string& line :
       {"Logged on User:" + shown, std::string(35, '-') + '\n' + shown, padded(40) + shown,
        '9' + std::string(18, ' ') + shown, padded(60) + "Stopped"}) {
    EXPECT_NE(before.find('\n' + line + '\n'), before.npos) << line << before;
    EXPECT_EQ(after.find('\n' + line + '\n'), after.npos) << line;
  }
  Machine().Services = {5, {}};
  EXPECT_EQ(services.Collect(), 5);
}

// The result of a collection of processes and, after it, what was found.
std::string CollectedProcesses() {
  CProcessList list;
  std::string text = std::to_string(list.Collect());
  for (const CProcessInfo& process : list.Processes) {
    text += ' ' + std::to_string(process.ProcessID) + ':' + process.Name;
  }
  return text;
}

TEST(Lists, LeaveOutThisProcessAndWhatCannotBeLookedAt) {
  Machine() = FakeMachine();
  EXPECT_EQ(CollectedProcesses(), "0");
  Machine().OwnProcess = 7;
  Machine().ProcessIDs = {{9, 0, 7, 8, 6, 4294967295U}};  // process 6 may not be looked at
  Machine().Modules = {{0, {"idle"}}, {7, {"self"}}, {8, {""}}, {9, {"a"}}, {4294967295U, {"b"}}};
  EXPECT_EQ(CollectedProcesses(), "0 9:a 8:UNK_NAME 4294967295:b");

  Machine().ExtendedVersion = SystemVersion{4, 10, 0, 0, "", 0, 0, 0, 0};  // Windows 98
  EXPECT_EQ(CollectedProcesses(), "1");
  Machine().ProcessEntries = {{{304, 1, "C:\\W\\KERNEL32.DLL"},
                               {304, 7, "C:\\self.exe"},
                               {296, 2, "C:\\short.exe"},
                               {304, 3, "PLAIN.EXE"},
                               {304, 4, "\\root.exe"}}};
  EXPECT_EQ(CollectedProcesses(), "0 1:KERNEL32.DLL 3:PLAIN.EXE 4:root.exe");
}

const int32_t firstGeneration = GetCopyGeneration();

TEST(Lists, AppendTheCopiesOfTheLayoutInForce) {
  EXPECT_EQ(firstGeneration, 1);
  Machine() = FakeMachine();
  Machine().Load("[SOFTWARE\\ZEK\\orx]\n");  // in this case it is no copy of the old layout
  SetCopyGeneration(0);
  CORXProductsList list;
  list.Collect();
  const std::string text = LoggedText([&list] { list.Print(); });
  EXPECT_TRUE(text.ends_with("*\nThere is no ORX prior to V9 Installed \n")) << text;

  Machine() = FakeMachine();
  Machine().Load(Golden("registry_added.txt"));
  for (const int32_t generation : {0, 1, 1}) {
    SetCopyGeneration(generation);
    EXPECT_EQ(list.Collect(), 0);
  }
  std::string names;
  for (const CORXCopy& copy : list.Copies) {
    names += std::to_string(copy.Generation) + ' ' + copy.Name + '|';
  }
  // The first is the parent of the later layout's copies.
  EXPECT_EQ(names, "0 ORX|1 Empty|1 C1|1 Empty|1 C1|");

  // What is no part of the report.
  const CORXCopy& copy = list.Copies.at(2);
  const auto& [version, release, modification, serviceLevel] = copy.VersionInfo;
  EXPECT_EQ(version + release + modification + serviceLevel, "940Level 0");
  const CORXProduct& product = copy.Products.at(0);
  EXPECT_EQ(product.CopyName + product.Title + product.Description, "C1not shownnor this");
  const CADMInstance& instance = copy.AdmInstances.at(0);
  EXPECT_EQ(instance.CopyName + instance.Name + instance.Parameters.at(0).Value, "C1ADM1shown");
}

}  // namespace
