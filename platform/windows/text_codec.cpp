#include "platform/text_codec.h"

#include <charconv>

#include "platform/ascii_case.h"
#include "platform/windows/system.h"

struct TextCodec::State {
  UINT CodePage;
};

// The number after one of the prefixes, as in "CP932"; 0 for other names.
static UINT CodePageOf(std::string_view name) {
  struct Prefix {
    std::string_view Text;
    UINT Base;
  };
  constexpr Prefix prefixes[] = {{"windows-", 0}, {"cp", 0}, {"iso-8859-", 28590}};
  for (const Prefix& prefix : prefixes) {
    std::string_view digits = name;
    if (!TakePrefixIgnoringCase(digits, prefix.Text)) {
      continue;
    }
    UINT number = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), number);
    const bool isWhole = error == std::errc() && end == digits.data() + digits.size();
    return isWhole ? prefix.Base + number : 0;
  }
  return EqualsIgnoringCase(name, "utf-8") ? CP_UTF8 : 0;
}

static std::string ConvertToUtf8(UINT codePage, std::string_view text) {
  const int size = static_cast<int>(text.size());
  const int count = ::MultiByteToWideChar(codePage, /*dwFlags=*/0, text.data(), size,
                                          /*lpWideCharStr=*/nullptr, /*cchWideChar=*/0);
  std::wstring wide(static_cast<size_t>(count), L'\0');
  ::MultiByteToWideChar(codePage, /*dwFlags=*/0, text.data(), size, wide.data(), count);
  const int bytes = ::WideCharToMultiByte(CP_UTF8, /*dwFlags=*/0, wide.data(), count,
                                          /*lpMultiByteStr=*/nullptr, /*cbMultiByte=*/0,
                                          /*lpDefaultChar=*/nullptr, /*lpUsedDefaultChar=*/nullptr);
  std::string result(static_cast<size_t>(bytes), '\0');
  ::WideCharToMultiByte(CP_UTF8, /*dwFlags=*/0, wide.data(), count, result.data(), bytes,
                        /*lpDefaultChar=*/nullptr, /*lpUsedDefaultChar=*/nullptr);
  return result;
}

std::optional<TextCodec> TextCodec::Open(const std::string& encoding) {
  const UINT codePage = CodePageOf(encoding);
  CPINFO info = {};
  if (codePage == 0 || ::GetCPInfo(codePage, &info) == FALSE) {
    return std::nullopt;
  }
  return TextCodec(std::make_shared<State>(State{codePage}));
}

std::string TextCodec::ToUtf8(std::string_view text) const {
  return ConvertToUtf8(Shared->CodePage, text);
}

std::string SystemTextToUtf8(std::string_view text) { return ConvertToUtf8(CP_ACP, text); }
