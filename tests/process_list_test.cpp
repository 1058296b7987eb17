#include "inventory/process_list.h"

#include <gtest/gtest.h>

#include "tests/fake_machine.h"

namespace {

SystemVersion Version(uint32_t platform, uint32_t major, uint32_t minor) {
  SystemVersion version;
  version.PlatformID = platform;
  version.MajorVersion = major;
  version.MinorVersion = minor;
  return version;
}

std::string Listed(const CProcessList& list) {
  std::string text;
  for (const CProcessInfo& process : list.Processes) {
    text += std::to_string(process.ProcessID) + ":" + process.Name + " ";
  }
  return text;
}

TEST(ProcessList, TellsTheSystemFamilies) {
  struct {
    SystemVersion System;
    bool IsNT;
  } const cases[] = {
      {Version(1, 4, 0), false},  {Version(2, 4, 0), true}, {Version(1, 4, 10), false},
      {Version(2, 4, 90), false}, {Version(1, 4, 3), true}, {Version(2, 10, 0), true},
  };
  for (const auto& test : cases) {
    Machine().ExtendedVersion = test.System;
    EXPECT_EQ(IsWindowsNTFamily(), test.IsNT)
        << test.System.PlatformID << ' ' << test.System.MinorVersion;
  }
  Machine().ExtendedVersion.reset();
  EXPECT_TRUE(IsWindowsNTFamily());
}

TEST(ProcessList, LeavesOutItselfAndProcessZeroOnNT) {
  Machine() = FakeMachine();
  Machine().OwnProcess = 7;
  Machine().ProcessIDs = {{9, 0, 7, 8, 4294967295U}};
  Machine().Modules = {
      {0, {"idle"}}, {7, {"self"}}, {8, {""}}, {9, {"a.exe"}}, {4294967295U, {"b"}}};
  CProcessList list;
  list.Processes.push_back({"old", 1});
  EXPECT_EQ(list.Collect(), 0);
  EXPECT_EQ(Listed(list), "9:a.exe 8:UNK_NAME 4294967295:b ");

  Machine().Modules.erase(9);  // a process that may not be looked at
  list.Collect();
  EXPECT_EQ(Listed(list), "8:UNK_NAME 4294967295:b ");

  Machine().ProcessIDs.reset();
  EXPECT_EQ(list.Collect(), 0);
  EXPECT_EQ(Listed(list), "");
}

TEST(ProcessList, WalksTheSnapshotOnWindows95) {
  Machine() = FakeMachine();
  Machine().ExtendedVersion = Version(1, 4, 10);
  Machine().OwnProcess = 7;
  CProcessList list;
  EXPECT_EQ(list.Collect(), 1);
  Machine().ProcessEntries = {{{304, 1, "C:\\W\\KERNEL32.DLL"},
                               {304, 7, "C:\\self.exe"},
                               {296, 2, "C:\\short.exe"},
                               {304, 3, "PLAIN.EXE"},
                               {304, 4, "\\root.exe"}}};
  EXPECT_EQ(list.Collect(), 0);
  EXPECT_EQ(Listed(list), "1:KERNEL32.DLL 3:PLAIN.EXE 4:root.exe ");
}

}  // namespace
