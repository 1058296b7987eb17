#include "platform/posix/registry/values.h"

#include <algorithm>
#include <charconv>
#include <cstdint>
#include <limits>
#include <utility>

namespace {

// Reads a line part by part and removes what it has read. After a failure, which the last part may
// be, what it returns has no meaning.
class LineParser {
 public:
  LineParser(std::string_view text, bool isHexTextWide)
      : Text(text), IsHexTextWide(isHexTextWide) {}

  std::string_view Rest() const { return Text; }
  bool HasFailed() const { return Failed; }
  bool Take(std::string_view word) { return !Failed && TakePrefixIgnoringCase(Text, word); }
  void Expect(std::string_view word) { Failed = !Take(word); }
  void SkipBlanks() { Text.remove_prefix(std::min(Text.find_first_not_of(" \t"), Text.size())); }
  void SkipLine() { Text.remove_prefix(std::min(Text.find('\n'), Text.size() - 1) + 1); }

  // Blanks and a comment may come before it.
  void ExpectLineEnd() {
    SkipBlanks();
    if (Text.starts_with(';')) {
      SkipLine();
    } else if (!Text.empty() && !Take("\r\n")) {
      Expect("\n");
    }
  }

  // "@" is the value without a name.
  std::string TakeName() {
    const std::string_view before = Text;
    std::string name = Take("@") ? "" : TakeQuoted();
    Failed = Failed || HasLineBreakSince(before);
    return name;
  }

  RegistryData TakeData() {
    if (Take("dword:")) {
      return TakeNumber();
    }
    return Take("hex") ? TakeHexData() : TakeText();
  }

 private:
  bool HasLineBreakSince(std::string_view before) const {
    return before.find('\n') < before.size() - Text.size();
  }

  std::string TakeQuoted() {
    std::string result;
    for (Expect("\""); !Failed && !Take("\"");) {
      const size_t plain = std::min(Text.find_first_of("\"\\"), Text.size());
      result += Text.substr(0, plain);
      Text.remove_prefix(plain);
      if (Text.starts_with('\\')) {
        result += TakeEscaped();
      }
      Failed = Text.empty();
    }
    return result;
  }

  // The escapes of line ends are Wine's. A backslash before any other character is one itself.
  std::string_view TakeEscaped() {
    const std::string_view escape = Text.substr(0, 2);
    Text.remove_prefix(escape.size());
    if (escape == "\\n" || escape == "\\r") {
      return escape == "\\n" ? "\n" : "\r";
    }
    return escape.substr(escape == "\\\\" || escape == "\\\"" ? 1 : 0);
  }

  // After a text of several lines, what looks like a comment may be the name of the next value:
  // then the text has no closing quotation mark.
  RegistryData TakeText() {
    const std::string_view before = Text;
    RegistryData data{kRegistryText, TakeQuoted() + '\0'};
    SkipBlanks();
    Failed = Failed || (HasLineBreakSince(before) && Text.starts_with(';'));
    return data;
  }

  uint32_t TakeHexNumber(uint32_t largest = std::numeric_limits<uint32_t>::max()) {
    uint32_t number = 0;
    const auto [stop, error] = std::from_chars(Text.data(), Text.data() + Text.size(), number, 16);
    Failed = Failed || error != std::errc() || number > largest;
    Text.remove_prefix(static_cast<size_t>(stop - Text.data()));
    return number;
  }

  RegistryData TakeNumber() {
    SkipBlanks();
    const uint32_t number = TakeHexNumber();
    RegistryData data{kRegistryNumber, ""};
    for (int bits = 0; bits < 32; bits += 8) {
      data.Bytes += static_cast<char>(number >> bits & 0xFF);
    }
    return data;
  }

  // Blanks, and line breaks after a backslash.
  void SkipBlanksAndJoints() {
    for (SkipBlanks(); Take("\\"); SkipBlanks()) {
      SkipBlanks();
      Take("\r\n") || Take("\n");
    }
  }

  // One or two digits for each byte, with commas between the bytes; possibly none at all.
  std::string TakeHexBytes() {
    std::string bytes;
    SkipBlanksAndJoints();
    bool isByteNext = Text.find_first_of("0123456789abcdefABCDEF") == 0;
    while (isByteNext && !Failed) {
      bytes += static_cast<char>(TakeHexNumber(/*largest=*/0xFF));
      SkipBlanksAndJoints();
      isByteNext = Take(",");
      SkipBlanksAndJoints();
    }
    return bytes;
  }

  // What comes after "hex": the kind of value in parentheses, if it is not binary, and its bytes.
  RegistryData TakeHexData() {
    enum : uint32_t { kExpandableText = 2, kBinary = 3, kMultipleText = 7 };
    RegistryData data{kBinary, ""};
    if (Take("(")) {
      data.Type = TakeHexNumber();
      Expect(")");
    }
    Expect(":");
    data.Bytes = TakeHexBytes();
    const bool isText =
        data.Type == kRegistryText || data.Type == kExpandableText || data.Type == kMultipleText;
    if (isText && IsHexTextWide) {
      DecodeUtf16(data.Bytes, std::string(data.Bytes));
    }
    return data;
  }

  std::string_view Text;
  bool IsHexTextWide;
  bool Failed = false;
};

}  // namespace

void RegistryValues::AddLines(std::string_view lines, const ExportFormat& format) {
  LineParser parser(lines, format.IsHexTextWide);
  for (parser.SkipBlanks(); !parser.Rest().empty() && !parser.Rest().starts_with('[');
       parser.SkipBlanks()) {
    LineParser line = parser;
    const std::string name = line.TakeName();
    line.SkipBlanks();
    line.Expect("=");
    line.SkipBlanks();
    const bool isRemoval = line.Take("-");
    RegistryData data = isRemoval ? RegistryData() : line.TakeData();
    line.ExpectLineEnd();
    if (line.HasFailed()) {
      parser.SkipLine();
      continue;
    }
    parser = line;
    if (isRemoval) {
      Values.erase(name);
    } else {
      Values.try_emplace(name, Value{++LastNumber, {}}).first->second.Data = std::move(data);
    }
  }
}

std::vector<std::string> RegistryValues::Names() const {
  std::map<size_t, std::string> ordered;
  for (const auto& [name, value] : Values) {
    ordered.emplace(value.Number, name);
  }
  std::vector<std::string> names;
  names.reserve(ordered.size());
  for (auto& [number, name] : ordered) {
    names.push_back(std::move(name));
  }
  return names;
}

const RegistryData* RegistryValues::Find(std::string_view name) const {
  const auto found = Values.find(name);
  return found == Values.end() ? nullptr : &found->second.Data;
}
