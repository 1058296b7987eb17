#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "inventory/info.h"

// Selects the processes that are printed, by Name: "ALL" selects every one.
inline constexpr std::array<std::string_view, 3> g_ProcessFilter = {"ALL", "orx", "msiexec"};

struct CProcessInfo {
  std::string Name;        // of the executable, without folder; "UNK_NAME" if it cannot be read
  uint32_t ProcessID = 0;  // the system's number of the process
};

// False if the version is that of Windows 95, 98 or Me; true if it is another or not known.
bool IsWindowsNTFamily();

// The running processes that the user may look at, without this one and process 0, in the system's
// order.
class CProcessList : public Info {
 public:
  // Returns 0, or 1 if a Windows 95 has no snapshot of its processes. A step that fails ends the
  // collection; what was found before stays.
  int32_t Collect() override;

  int32_t Print() override;
  bool Matches(const CProcessInfo& process) const;

  std::vector<CProcessInfo> Processes;

 private:
  int32_t CollectNT();
  int32_t CollectWindows95();
};
