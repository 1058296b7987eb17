#pragma once

#include <cstddef>
#include <string>
#include <string_view>

// The two encodings of a registry export. Either way a line ends with a line feed, which a carriage
// return may precede.
enum class ExportEncoding {
  kUtf8,
  kUtf16,  // lowest byte first
};

// The bytes of an ASCII character.
constexpr size_t CharacterWidth(ExportEncoding encoding) {
  return encoding == ExportEncoding::kUtf16 ? 2 : 1;
}

// Whether an ASCII character stands at a place, which begins a character.
bool HasCharacterAt(std::string_view bytes, ExportEncoding encoding, size_t at, char c);

// The place of an ASCII character in encoded bytes, from a place on; npos if there is none. Both
// places count bytes and begin a character.
size_t FindCharacter(std::string_view bytes, ExportEncoding encoding, char c, size_t from);

// The same from the end of the bytes back.
size_t FindLastCharacter(std::string_view bytes, ExportEncoding encoding, char c);

// Appends UTF-16 bytes as UTF-8. A surrogate without its other half becomes U+FFFD; a last odd byte
// is dropped.
void AppendNarrowed(std::string& text, std::string_view utf16);

// Encoded bytes as UTF-8: the bytes themselves, valid or not, or what it makes of them in the
// buffer.
std::string_view Decoded(std::string_view bytes, ExportEncoding encoding, std::string& buffer);
