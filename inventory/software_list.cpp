#include "inventory/software_list.h"

#include <algorithm>
#include <cstdlib>
#include <iomanip>
#include <limits>

#include "eventlog/logger.h"
#include "inventory/filter.h"
#include "platform/registry.h"
#include "products/registry_value.h"

// Returns the nearest number in range, whatever the size of a long.
static int32_t ParseNumber(const std::string& text) {
  using Limits = std::numeric_limits<int32_t>;
  const long long number = std::strtoll(text.c_str(), nullptr, 10);
  return static_cast<int32_t>(std::clamp<long long>(number, Limits::min(), Limits::max()));
}

static CProductInfo ReadProduct(const std::string& root, const std::string& name) {
  const std::string keyPath = root + "\\" + name + "\\InstallProperties";
  CProductInfo product;
  product.DisplayName = ReadRegistryValue(keyPath, "DisplayName");
  product.DisplayVersion = ReadRegistryValue(keyPath, "DisplayVersion");
  product.InstallDate = ReadRegistryValue(keyPath, "InstallDate");
  product.InstallLocation = ReadRegistryValue(keyPath, "InstallLocation");
  product.Language = ParseNumber(ReadRegistryValue(keyPath, "Language"));
  product.Publisher = ReadRegistryValue(keyPath, "Publisher");
  return product;
}

int32_t CProductsList::Collect() {
  const std::string root =
      "SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Products";
  for (const std::string& name : EnumRegistrySubKeys(root)) {
    Products.push_back(ReadProduct(root, name));
  }
  return 0;
}

bool CProductsList::Matches(const CProductInfo& product) const {
  return MatchesFilter(g_PublisherFilter, product.Publisher);
}

static void PrintRow(const CProductInfo& product) {
  CLogger& log = CLogger::GetInstance();
  log << std::left << std::setfill(' ');
  log << std::setw(30) << product.Publisher << std::setw(65) << product.DisplayName;
  log << std::setw(20) << product.DisplayVersion << std::setw(14) << product.InstallDate;
  log << std::setw(11) << static_cast<uint32_t>(product.Language) << product.InstallLocation
      << std::endl;
}

int32_t CProductsList::Print() {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(185, '-');
  log << std::endl;
  log << rule << std::endl;
  log << "Publisher                     "
         "Product Name                                                     "
         "Version             InstallDate   Language   Location"
      << std::endl;
  log << rule << std::endl;
  for (const CProductInfo& product : Products) {
    if (Matches(product)) {
      PrintRow(product);
    }
  }
  log << rule << std::endl;
  return 0;
}
