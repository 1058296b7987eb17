#include "inventory/shown_name.h"

#include <cstdint>

#include "platform/path.h"

static bool IsControl(char c) {
  const auto byte = static_cast<uint8_t>(c);
  return byte < 0x20 || byte == 0x7F;
}

std::string ShownName(const std::string& name) {
  std::string shown;
  for (size_t i = 0; i < name.size(); ++i) {
    const auto byte = static_cast<uint8_t>(name[i]);
    if (IsLeadByte(name[i]) && i + 1 < name.size() && !IsControl(name[i + 1])) {
      shown.append(name, i++, 2);
    } else if (byte >= 0x80 && byte < 0xA0 && shown.ends_with('\xC2')) {
      shown.back() = '?';
    } else {
      shown += IsControl(name[i]) ? '?' : name[i];
    }
  }
  return shown;
}
