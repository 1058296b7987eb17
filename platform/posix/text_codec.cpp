#include "platform/text_codec.h"

#include <iconv.h>

#include <cerrno>
#include <cstdint>

#include "platform/ascii_case.h"
#include "platform/utf8.h"

struct TextCodec::State {
  explicit State(iconv_t converter) : Converter(converter) {}
  ~State() { ::iconv_close(Converter); }
  State(const State&) = delete;
  State& operator=(const State&) = delete;

  iconv_t Converter;
};

std::optional<TextCodec> TextCodec::Open(const std::string& encoding) {
  std::string_view number = encoding;
  const std::string name =
      TakePrefixIgnoringCase(number, "windows-") ? "CP" + std::string(number) : encoding;
  if (name.empty()) {
    return std::nullopt;  // for iconv it is the encoding of the locale
  }
  iconv_t converter = ::iconv_open("UTF-8", name.c_str());
  if (reinterpret_cast<intptr_t>(converter) == -1) {
    return std::nullopt;
  }
  return TextCodec(std::make_shared<State>(converter));
}

std::string TextCodec::ToUtf8(std::string_view text) const {
  ::iconv(Shared->Converter, /*inbuf=*/nullptr, /*inbytesleft=*/nullptr, /*outbuf=*/nullptr,
          /*outbytesleft=*/nullptr);
  std::string result;
  char* input = const_cast<char*>(text.data());  // iconv does not write there
  size_t left = text.size();
  while (left > 0) {
    char piece[1024];
    char* output = piece;
    size_t space = sizeof piece;
    const size_t converted = ::iconv(Shared->Converter, &input, &left, &output, &space);
    result.append(piece, sizeof piece - space);
    if (converted == static_cast<size_t>(-1) && errno != E2BIG) {
      AppendUtf8(result, kReplacementCharacter);
      ++input;
      --left;
    }
  }
  return result;
}

std::string SystemTextToUtf8(std::string_view text) { return std::string(text); }
