#include "products/parameter.h"

#include "platform/registry.h"
#include "products/registry_value.h"

void AppendParameters(const std::string& keyPath, std::vector<CParameter>& parameters) {
  for (const std::string& name : EnumRegistryValueNames(keyPath)) {
    parameters.push_back({name, ReadRegistryValue(keyPath, name)});
  }
}
