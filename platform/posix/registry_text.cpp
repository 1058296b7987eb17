#include "platform/posix/registry_text.h"

#include <cstdint>
#include <cstring>

namespace {

// The same for any place: a byte may also be the second half of a character.
bool IsWholeCharacter(std::string_view bytes, ExportEncoding encoding, size_t at, char c) {
  return at % CharacterWidth(encoding) == 0 && HasCharacterAt(bytes, encoding, at, c);
}

uint32_t UnitAt(std::string_view utf16, size_t at) {
  return static_cast<uint32_t>(static_cast<uint8_t>(utf16[at])) |
         static_cast<uint32_t>(static_cast<uint8_t>(utf16[at + 1])) << 8;
}

bool StartsWithFourAscii(std::string_view utf16, size_t at) {
  uint64_t units = 0;
  if (at + sizeof units > utf16.size()) {
    return false;
  }
  std::memcpy(&units, utf16.data() + at, sizeof units);
  return (units & 0xFF80FF80FF80FF80) == 0;
}

bool IsLeading(uint32_t unit) { return unit >= 0xD800 && unit <= 0xDBFF; }
bool IsTrailing(uint32_t unit) { return unit >= 0xDC00 && unit <= 0xDFFF; }

// Reads one character and moves the place behind it.
uint32_t TakeCharacter(std::string_view utf16, size_t& at) {
  constexpr uint32_t replacement = 0xFFFD;
  const uint32_t unit = UnitAt(utf16, at);
  at += 2;
  if (IsTrailing(unit)) {
    return replacement;
  }
  if (!IsLeading(unit)) {
    return unit;
  }
  if (at + 1 >= utf16.size() || !IsTrailing(UnitAt(utf16, at))) {
    return replacement;
  }
  const uint32_t character = 0x10000 + ((unit - 0xD800) << 10) + (UnitAt(utf16, at) - 0xDC00);
  at += 2;
  return character;
}

char* PutContinued(char* out, uint32_t character, int bits) {
  for (; bits >= 0; bits -= 6) {
    *out++ = static_cast<char>(0x80 | (character >> bits & 0x3F));
  }
  return out;
}

char* PutCharacter(char* out, uint32_t character) {
  if (character < 0x80) {
    *out++ = static_cast<char>(character);
    return out;
  }
  if (character < 0x800) {
    *out++ = static_cast<char>(0xC0 | character >> 6);
    return PutContinued(out, character, 0);
  }
  if (character < 0x10000) {
    *out++ = static_cast<char>(0xE0 | character >> 12);
    return PutContinued(out, character, 6);
  }
  *out++ = static_cast<char>(0xF0 | character >> 18);
  return PutContinued(out, character, 12);
}

}  // namespace

bool HasCharacterAt(std::string_view bytes, ExportEncoding encoding, size_t at, char c) {
  return bytes[at] == c &&
         (encoding == ExportEncoding::kUtf8 || (at + 1 < bytes.size() && bytes[at + 1] == '\0'));
}

size_t FindCharacter(std::string_view bytes, ExportEncoding encoding, char c, size_t from) {
  size_t at = bytes.find(c, from);
  while (at != std::string_view::npos && !IsWholeCharacter(bytes, encoding, at, c)) {
    at = bytes.find(c, at + 1);
  }
  return at;
}

size_t FindLastCharacter(std::string_view bytes, ExportEncoding encoding, char c) {
  size_t at = bytes.rfind(c);
  while (at != std::string_view::npos && !IsWholeCharacter(bytes, encoding, at, c)) {
    at = at == 0 ? std::string_view::npos : bytes.rfind(c, at - 1);
  }
  return at;
}

void AppendNarrowed(std::string& text, std::string_view utf16) {
  const size_t before = text.size();
  text.resize(before + utf16.size() / 2 * 3);  // no unit takes more than three bytes
  char* out = text.data() + before;
  size_t at = 0;
  while (at + 1 < utf16.size()) {
    // Nearly all of it is ASCII, and four of its characters go as fast as one.
    while (StartsWithFourAscii(utf16, at)) {
      for (const size_t end = at + 8; at < end; at += 2) {
        *out++ = utf16[at];
      }
    }
    if (at + 1 < utf16.size()) {
      out = PutCharacter(out, TakeCharacter(utf16, at));
    }
  }
  text.resize(static_cast<size_t>(out - text.data()));
}

std::string_view Decoded(std::string_view bytes, ExportEncoding encoding, std::string& buffer) {
  if (encoding == ExportEncoding::kUtf8) {
    return bytes;
  }
  buffer.clear();
  AppendNarrowed(buffer, bytes);
  return buffer;
}
