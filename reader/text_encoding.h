#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "platform/text_codec.h"

// True for text that is well-formed UTF-8: no overlong form, no surrogate, nothing above U+10FFFF.
bool IsUtf8(std::string_view text);

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
