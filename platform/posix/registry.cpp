#include "platform/registry.h"

RegistryData ReadRegistryData(const std::string&, const std::string&, size_t, RegistryAccess) {
  return {};
}
std::vector<std::string> EnumRegistryValueNames(const std::string&) { return {}; }
std::vector<std::string> EnumRegistrySubKeys(const std::string&) { return {}; }
