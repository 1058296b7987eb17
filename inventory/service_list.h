#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "inventory/info.h"

// Selects the services that are printed, by DisplayName.
inline constexpr std::array<std::string_view, 2> g_ServiceFilter = {"ORX", "Windows Installer"};

struct CServiceInfo {
  std::string ServiceName;  // not part of the report
  std::string DisplayName;
  std::string Status;  // the state in words
};

// The machine's services in the system's order, as platform/services.h lists them; none if they
// cannot be listed.
class CServicesList : public Info {
 public:
  // Returns 0, or the system's code for the step that failed. Waits at most two seconds.
  int32_t Collect() override;

  int32_t Print() override;
  bool Matches(const CServiceInfo& service) const;

  std::vector<CServiceInfo> Services;
};
