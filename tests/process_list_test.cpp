#include "inventory/process_list.h"

#include <gtest/gtest.h>

#include "tests/support/fake_machine.h"

namespace {

// The result and, after it, what was found.
std::string Collected(CProcessList& list) {
  std::string text = std::to_string(list.Collect());
  for (const CProcessInfo& process : list.Processes) {
    text += ' ' + std::to_string(process.ProcessID) + ':' + process.Name;
  }
  return text;
}

TEST(ProcessList, LeavesOutItselfAndProcessZeroOnNT) {
  Machine() = FakeMachine();
  Machine().OwnProcess = 7;
  Machine().ProcessIDs = {{9, 0, 7, 8, 6, 4294967295U}};  // process 6 may not be looked at
  Machine().Modules = {{0, {"idle"}}, {7, {"self"}}, {8, {""}}, {9, {"a"}}, {4294967295U, {"b"}}};
  CProcessList list;
  list.Processes.push_back({"old", 1});
  EXPECT_EQ(Collected(list), "0 9:a 8:UNK_NAME 4294967295:b");
  Machine().ProcessIDs.reset();
  EXPECT_EQ(Collected(list), "0");
}

TEST(ProcessList, WalksTheSnapshotOnWindows95) {
  Machine() = FakeMachine();
  Machine().ExtendedVersion = SystemVersion{4, 10, 0, 0, "", 0, 0, 0, 0};
  Machine().OwnProcess = 7;
  CProcessList list;
  EXPECT_EQ(Collected(list), "1");
  Machine().ProcessEntries = {{{304, 1, "C:\\W\\KERNEL32.DLL"},
                               {304, 7, "C:\\self.exe"},
                               {296, 2, "C:\\short.exe"},
                               {304, 3, "PLAIN.EXE"},
                               {304, 4, "\\root.exe"}}};
  EXPECT_EQ(Collected(list), "0 1:KERNEL32.DLL 3:PLAIN.EXE 4:root.exe");
}

}  // namespace
