#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "inventory/info.h"

inline constexpr std::array<std::string_view, 3> g_ProcessFilter = {"ALL", "orx", "msiexec"};

struct CProcessInfo {
  std::string Name;  // of the executable, without folder; "UNK_NAME" if it cannot be read
  uint32_t ProcessID = 0;
};

// False on Windows 95, 98 and Me, true on any other system.
bool IsWindowsNTFamily();

// The running processes that the tool may look at, itself and process 0 left out. A step that
// fails ends the collection with what it has.
class CProcessList : public Info {
 public:
  int32_t Collect() override;
  int32_t Print() override;
  bool Matches(const CProcessInfo& process) const;

  std::vector<CProcessInfo> Processes;

 private:
  int32_t CollectNT();
  int32_t CollectWindows95();
};
