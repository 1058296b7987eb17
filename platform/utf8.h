#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

// UTF-8 and UTF-16, on every system. Nothing here fails.

inline constexpr char32_t kReplacementCharacter = 0xFFFD;  // for what is no character

// Writes a character as UTF-8, at most four bytes, and returns the end of what it wrote.
inline char* PutUtf8(char* out, char32_t character) {
  if (character < 0x80) {
    *out++ = static_cast<char>(character);
    return out;
  }
  constexpr char32_t firstByte[] = {0, 0xC0, 0xE0, 0xF0};
  const int moreBytes = character < 0x800 ? 1 : character < 0x10000 ? 2 : 3;
  *out++ = static_cast<char>(firstByte[moreBytes] | character >> (6 * moreBytes));
  for (int bits = 6 * (moreBytes - 1); bits >= 0; bits -= 6) {
    *out++ = static_cast<char>(0x80 | (character >> bits & 0x3F));
  }
  return out;
}

inline void AppendUtf8(std::string& text, char32_t character) {
  char bytes[4];
  text.append(bytes, PutUtf8(bytes, character));
}

// The first character of valid UTF-8 that is not empty, which is removed from it.
inline char32_t TakeCharacter(std::string_view& text) {
  const auto first = static_cast<uint8_t>(text.front());
  const size_t length = first < 0x80 ? 1 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
  char32_t character = length == 1 ? first : first & (0x7FU >> length);
  for (const char c : text.substr(1, length - 1)) {
    character = character << 6 | (static_cast<uint8_t>(c) & 0x3F);
  }
  text.remove_prefix(std::min(length, text.size()));
  return character;
}

// The number of UTF-16 units of UTF-8: two for a character of four bytes, one for any other.
inline size_t Utf16Length(std::string_view text) {
  size_t units = 0;
  for (const char c : text) {
    const auto byte = static_cast<uint8_t>(c);
    units += byte >= 0xF0 ? 2 : (byte & 0xC0) == 0x80 ? 0 : 1;
  }
  return units;
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

// Sets a text to the UTF-8 of UTF-16LE, whose bytes it must not contain. A surrogate without its
// other half becomes the replacement character; a last odd byte is dropped.
inline void DecodeUtf16(std::string& text, std::string_view utf16) {
  const size_t units = utf16.size() / 2;
  const auto unitAt = [&](size_t at) -> char32_t {
    return at == units ? 0
                       : static_cast<uint8_t>(utf16[2 * at]) |
                             static_cast<char32_t>(static_cast<uint8_t>(utf16[2 * at + 1])) << 8;
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
    char32_t character = unitAt(at++);
    if (character >> 11 == 0xD800 >> 11) {  // a surrogate
      const char32_t next = unitAt(at);
      const bool isPair = character < 0xDC00 && next >> 10 == 0xDC00 >> 10;
      character =
          isPair ? 0x10000 + ((character - 0xD800) << 10) + (next - 0xDC00) : kReplacementCharacter;
      at += isPair ? 1 : 0;
    }
    out = PutUtf8(out, character);
  }
  text.resize(static_cast<size_t>(out - text.data()));
}
