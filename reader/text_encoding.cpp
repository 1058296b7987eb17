#include "reader/text_encoding.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "platform/utf8.h"

static bool IsAscii(std::string_view text) {
  return std::all_of(text.begin(), text.end(), [](char c) { return (c & 0x80) == 0; });
}

// The bytes of the well-formed character at the start of the text, which is not empty; 0 if there
// is none.
static size_t CharacterLength(std::string_view text) {
  const auto at = [&](size_t i) {
    return i < text.size() ? static_cast<uint8_t>(text[i]) : uint8_t{0};
  };
  const uint8_t first = at(0);
  if (first < 0x80) {
    return 1;
  }
  const size_t length = first >= 0xC2 && first <= 0xDF   ? 2
                        : first >= 0xE0 && first <= 0xEF ? 3
                        : first >= 0xF0 && first <= 0xF4 ? 4
                                                         : 0;
  // The range of the second byte keeps out overlong forms, surrogates and what is above U+10FFFF.
  const uint8_t least = first == 0xE0 ? 0xA0 : first == 0xF0 ? 0x90 : 0x80;
  const uint8_t most = first == 0xED ? 0x9F : first == 0xF4 ? 0x8F : 0xBF;
  if (length == 0 || at(1) < least || at(1) > most) {
    return 0;
  }
  for (size_t i = 2; i < length; ++i) {
    if (at(i) < 0x80 || at(i) > 0xBF) {
      return 0;
    }
  }
  return length;
}

bool IsUtf8(std::string_view text) {
  if (IsAscii(text)) {
    return true;
  }
  while (!text.empty()) {
    const size_t length = CharacterLength(text);
    if (length == 0) {
      return false;
    }
    text.remove_prefix(length);
  }
  return true;
}

std::string_view FirstBytes(std::string_view text, size_t most) {
  if (text.size() <= most) {
    return text;
  }
  constexpr size_t longest = 4;  // of a character
  size_t end = most;
  while (end > 0 && most - end < longest && (text[end] & 0xC0) == 0x80) {
    --end;
  }
  return text.substr(0, end);
}

std::string Shortened(std::string_view text, size_t most) {
  const std::string_view kept = FirstBytes(text, most);
  return std::string(kept) + (kept.size() < text.size() ? "\u2026" : "");
}

static std::string FromWindows1252(std::string_view raw) {
  // The characters of 0x80 to 0x9F; the others are those of Unicode.
  constexpr char32_t special[] = {0x20AC, 0xFFFD, 0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021,
                                  0x02C6, 0x2030, 0x0160, 0x2039, 0x0152, 0xFFFD, 0x017D, 0xFFFD,
                                  0xFFFD, 0x2018, 0x2019, 0x201C, 0x201D, 0x2022, 0x2013, 0x2014,
                                  0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0xFFFD, 0x017E, 0x0178};
  std::string text;
  text.reserve(raw.size() + raw.size() / 4);
  for (const char c : raw) {
    const auto byte = static_cast<uint8_t>(c);
    AppendUtf8(text, byte >= 0x80 && byte < 0xA0 ? special[byte - 0x80] : char32_t{byte});
  }
  return text;
}

std::optional<TextDecoder> TextDecoder::Open(const std::string& encoding) {
  TextDecoder decoder;
  decoder.Codec = TextCodec::Open(encoding);
  return decoder.Codec ? std::optional(std::move(decoder)) : std::nullopt;
}

std::string TextDecoder::ToUtf8(std::string_view raw) const {
  if (IsUtf8(raw)) {
    return std::string(raw);
  }
  return Codec ? Codec->ToUtf8(raw) : FromWindows1252(raw);
}
