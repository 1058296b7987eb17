#include "products/registry_value.h"

#include <cstdint>

#include "platform/registry.h"

// Empty for data that is not a number of 32 bits.
static std::string SignedDigits(const std::string& bytes) {
  if (bytes.size() != sizeof(uint32_t)) {
    return "";
  }
  uint32_t number = 0;
  for (size_t i = bytes.size(); i > 0; --i) {
    number = number << 8 | static_cast<uint8_t>(bytes[i - 1]);
  }
  return std::to_string(static_cast<int32_t>(number));
}

std::string ReadRegistryValue(const std::string& keyPath, const std::string& valueName) {
  constexpr size_t limit = 100;
  const RegistryData data =
      ReadRegistryData(keyPath, valueName, limit, RegistryAccess::kReadAndSet);
  switch (data.Type) {
    case kRegistryText:
      return data.Bytes.substr(0, data.Bytes.find('\0'));
    case kRegistryNumber:
      return SignedDigits(data.Bytes);
    default:
      return "";
  }
}
