#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

#include "platform/utf8.h"

// The text of a registry export, in UTF-8 or UTF-16LE. Offsets and sizes count bytes.

// Copies up to size bytes of the export, from an offset on, and returns how many: fewer only at the
// end, or where reading fails. An export ends after 1 GiB, so that 32 bits hold an offset.
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

// Bytes of the export as UTF-8, valid or not. The result may be in the buffer.
inline std::string_view Decoded(std::string_view bytes, size_t width, std::string& buffer) {
  if (width == 1) {
    return bytes;
  }
  DecodeUtf16(buffer, bytes);
  return buffer;
}
