#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

// The text of a registry export, in UTF-8 or UTF-16LE. Offsets and sizes count bytes.

// Copies bytes of the export from an offset on and returns how many: fewer than asked for only at
// the end, or where reading fails. An export ends after 1 GiB, so that 32 bits hold an offset.
using ByteReader = std::function<size_t(uint64_t offset, char* buffer, size_t size)>;
inline constexpr uint64_t kLongestExport = uint64_t{1} << 30;

struct ExportFormat {
  uint64_t Begin = 0;         // of the text, after the byte order mark
  size_t CharacterWidth = 1;  // of an ASCII character: 1 in UTF-8, 2 in UTF-16LE
  bool IsHexTextWide = true;  // text in hexadecimal form is UTF-16LE; narrow after "REGEDIT4"
};

// Whether the character that begins at an offset is the ASCII character c.
inline bool HasCharacterAt(std::string_view bytes, size_t width, size_t at, char c) {
  return bytes[at] == c && (width == 1 || (at + 1 < bytes.size() && bytes[at + 1] == '\0'));
}

// The offset of the first ASCII character c from an offset on; the size of the bytes if there is
// none. In UTF-16LE a byte of that value may be half of another character.
inline size_t FindCharacter(std::string_view bytes, size_t width, char c, size_t from) {
  size_t at = bytes.find(c, from);
  while (at != std::string_view::npos &&
         (at % width != 0 || !HasCharacterAt(bytes, width, at, c))) {
    at = bytes.find(c, at + 1);
  }
  return std::min(at, bytes.size());
}

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
  for (size_t at = 0; at < units; ++at) {
    uint32_t character = unitAt(at);
    if (character >> 11 == 0xD800 >> 11) {  // a surrogate
      const uint32_t next = unitAt(at + 1);
      const bool isPair = character < 0xDC00 && next >> 10 == 0xDC00 >> 10;
      character = isPair ? 0x10000 + ((character - 0xD800) << 10) + (next - 0xDC00) : 0xFFFD;
      at += isPair ? 1 : 0;
    }
    out = PutUtf8(out, character);
  }
  text.resize(static_cast<size_t>(out - text.data()));
}

// Bytes of the export as UTF-8, valid or not. The result may be in the buffer.
inline std::string_view Decoded(std::string_view bytes, size_t width, std::string& buffer) {
  if (width == 1) {
    return bytes;
  }
  NarrowInto(buffer, bytes);
  return buffer;
}
