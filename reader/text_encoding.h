#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

#include "platform/text_codec.h"

// True for text that is well-formed UTF-8: no overlong form, no surrogate, nothing above U+10FFFF.
bool IsUtf8(std::string_view text);

// As much of a text as the limit in bytes allows, without a part of a character of UTF-8 at its
// end.
std::string_view FirstBytes(std::string_view text, size_t most);

// The same with "\u2026" after it if something was cut off.
std::string Shortened(std::string_view text, size_t most);

// Converts the text of a history, which is in UTF-8 or in the code page of the machine that wrote
// it, to UTF-8. The result is always valid.
class TextDecoder {
 public:
  // Text that is not valid UTF-8 is taken for Windows-1252.
  TextDecoder() = default;

  // Text that is not valid UTF-8 is taken for the named encoding (TextCodec). Nothing if the system
  // does not know it.
  static std::optional<TextDecoder> Open(const std::string& encoding);

  std::string ToUtf8(std::string_view raw) const;

 private:
  std::optional<TextCodec> Codec;
};
