#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "inventory/info.h"

inline constexpr std::array<std::string_view, 4> g_PublisherFilter = {
    "Microsoft", "ZEK", "InstallShield", "Orrin Software"};

// What the machine's installer records of one product; a missing value is empty.
struct CProductInfo {
  std::string DisplayName;
  std::string DisplayVersion;
  std::string InstallDate;
  std::string InstallLocation;
  std::string Publisher;
  int32_t Language = 0;  // 0 for a text that does not begin with a number
};

// The software installed for all users of the machine, in the registry's order; those of the
// publishers of interest are printed.
class CProductsList : public Info {
 public:
  int32_t Collect() override;
  int32_t Print() override;
  bool Matches(const CProductInfo& product) const;

  std::vector<CProductInfo> Products;
};
