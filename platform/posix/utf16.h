#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

// Writes a character as UTF-8, at most four bytes, and returns the end of what it wrote.
inline char* PutUtf8(char* out, uint32_t character) {
  if (character < 0x80) {
    *out++ = static_cast<char>(character);
    return out;
  }
  constexpr uint32_t firstByte[] = {0, 0xC0, 0xE0, 0xF0};
  const int moreBytes = character < 0x800 ? 1 : character < 0x10000 ? 2 : 3;
  *out++ = static_cast<char>(firstByte[moreBytes] | character >> (6 * moreBytes));
  for (int bits = 6 * (moreBytes - 1); bits >= 0; bits -= 6) {
    *out++ = static_cast<char>(0x80 | (character >> bits & 0x3F));
  }
  return out;
}

// True if at least four characters are left and the next four are ASCII.
inline bool StartsWithFourAscii(std::string_view utf16) {
  constexpr char maskBytes[] = "\x80\xFF\x80\xFF\x80\xFF\x80\xFF";  // in any byte order
  uint64_t mask = 0;
  uint64_t units = 0;
  if (utf16.size() < sizeof units) {
    return false;
  }
  std::memcpy(&mask, maskBytes, sizeof mask);
  std::memcpy(&units, utf16.data(), sizeof units);
  return (units & mask) == 0;
}

// UTF-16LE as UTF-8. A surrogate without its other half becomes U+FFFD; a last odd byte is dropped.
inline void NarrowInto(std::string& text, std::string_view utf16) {
  const size_t units = utf16.size() / 2;
  const auto unitAt = [&](size_t at) -> uint32_t {
    return at == units ? 0
                       : static_cast<uint8_t>(utf16[2 * at]) |
                             static_cast<uint32_t>(static_cast<uint8_t>(utf16[2 * at + 1])) << 8;
  };
  text.resize(units * 3);  // a unit takes at most three bytes
  char* out = text.data();
  for (size_t at = 0; at < units;) {
    if (StartsWithFourAscii(utf16.substr(2 * at))) {  // faster, and true for most text
      for (const size_t end = at + 4; at < end; ++at) {
        *out++ = utf16[2 * at];
      }
      continue;
    }
    uint32_t character = unitAt(at++);
    if (character >> 11 == 0xD800 >> 11) {  // a surrogate
      const uint32_t next = unitAt(at);
      const bool isPair = character < 0xDC00 && next >> 10 == 0xDC00 >> 10;
      character = isPair ? 0x10000 + ((character - 0xD800) << 10) + (next - 0xDC00) : 0xFFFD;
      at += isPair ? 1 : 0;
    }
    out = PutUtf8(out, character);
  }
  text.resize(static_cast<size_t>(out - text.data()));
}
