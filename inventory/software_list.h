#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "inventory/info.h"

// Selects the products that are printed, by Publisher.
inline constexpr std::array<std::string_view, 4> g_PublisherFilter = {
    "Microsoft", "ZEK", "InstallShield", "Orrin Software"};

// The record that Windows Installer keeps of one product. The texts are the values of these names
// as the registry has them; one that is missing or longer than 99 bytes is empty.
struct CProductInfo {
  std::string DisplayName;
  std::string DisplayVersion;
  std::string InstallDate;  // usually year, month and day: "20200131"
  std::string InstallLocation;
  std::string Publisher;
  int32_t Language = 0;  // the number of a locale, limited to 32 bits; 0 if there is none
};

// The software installed for all users of the machine, in the registry's order.
class CProductsList : public Info {
 public:
  // Appends to Products. Returns 0.
  int32_t Collect() override;

  int32_t Print() override;
  bool Matches(const CProductInfo& product) const;

  std::vector<CProductInfo> Products;
};
