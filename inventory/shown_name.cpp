#include "inventory/shown_name.h"

#include <cstdint>

std::string ShownName(const std::string& name) {
  std::string shown;
  for (const char c : name) {
    const auto byte = static_cast<uint8_t>(c);
    if (byte >= 0x80 && byte < 0xA0 && shown.ends_with('\xC2')) {
      shown.back() = '?';
    } else {
      shown += byte < 0x20 || byte == 0x7F ? '?' : c;
    }
  }
  return shown;
}
