#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

// Reads text of one encoding as UTF-8. The encodings are those that the system has: "CP932" or
// "windows-932" names the code page of that number everywhere, "ISO-8859-1" to "ISO-8859-15" those.
// Windows: MultiByteToWideChar. POSIX: iconv, with every name that it knows.
class TextCodec {
 public:
  // Nothing if the system does not know the encoding.
  static std::optional<TextCodec> Open(const std::string& encoding);

  // Always valid UTF-8. Bytes that are no character of the encoding become U+FFFD (on Windows, for
  // some encodings, the system's default character).
  std::string ToUtf8(std::string_view text) const;

 private:
  struct State;
  explicit TextCodec(std::shared_ptr<State> state) : Shared(std::move(state)) {}
  std::shared_ptr<State> Shared;
};

// Text from the system itself (an argument, the name of a file) as UTF-8.
// Windows: from the code page of the process. POSIX: the text as it is.
std::string SystemTextToUtf8(std::string_view text);
