#include "platform/posix/registry_lines.h"

#include <charconv>
#include <optional>
#include <string>
#include <utility>

#include "platform/ascii_case.h"
#include "platform/posix/registry_text.h"

// Each Take function reads one part of a line and moves the text behind it. One that gives false or
// nothing may have moved it anywhere: the line is then given up.

namespace {

constexpr uint32_t typeExpandableText = 2;
constexpr uint32_t typeBinary = 3;
constexpr uint32_t typeMultipleText = 7;

struct ValueLine {
  std::string Name;
  std::optional<RegistryData> Data;  // nothing for a value that is to be removed
};

void SkipBlanks(std::string_view& text) {
  text.remove_prefix(std::min(text.find_first_not_of(" \t"), text.size()));
}

void SkipLine(std::string_view& text) {
  const size_t end = text.find('\n');
  text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
}

bool TakeWord(std::string_view& text, std::string_view word) {
  if (!EqualsIgnoringCase(text.substr(0, word.size()), word)) {
    return false;
  }
  text.remove_prefix(word.size());
  return true;
}

// The end of a line, in front of which blanks and a comment may stand.
bool TakeLineEnd(std::string_view& text) {
  SkipBlanks(text);
  if (text.empty()) {
    return true;
  }
  if (text.front() == ';') {
    SkipLine(text);
    return true;
  }
  return TakeWord(text, "\r\n") || TakeWord(text, "\n");
}

void AppendEscaped(std::string& result, char escaped) {
  switch (escaped) {
    case 'n':  // these two are Wine's
      result += '\n';
      return;
    case 'r':
      result += '\r';
      return;
    case '\\':
    case '"':
      result += escaped;
      return;
    default:
      result += '\\';
      result += escaped;
      return;
  }
}

// A text in quotation marks, which may go on over line ends.
std::optional<std::string> TakeQuoted(std::string_view& text) {
  if (!TakeWord(text, "\"")) {
    return std::nullopt;
  }
  std::string result;
  while (true) {
    const size_t plain = text.find_first_of("\"\\");
    if (plain == std::string_view::npos) {
      return std::nullopt;
    }
    result += text.substr(0, plain);
    const bool isEnd = text[plain] == '"';
    text.remove_prefix(plain + 1);
    if (isEnd) {
      return result;
    }
    if (text.empty()) {
      return std::nullopt;
    }
    AppendEscaped(result, text.front());
    text.remove_prefix(1);
  }
}

std::optional<uint32_t> TakeHexNumber(std::string_view& text) {
  uint32_t number = 0;
  const auto [stop, error] = std::from_chars(text.data(), text.data() + text.size(), number, 16);
  if (error != std::errc()) {
    return std::nullopt;
  }
  text.remove_prefix(static_cast<size_t>(stop - text.data()));
  return number;
}

// Blanks, and line ends behind a backslash.
void SkipBlanksAndJoints(std::string_view& text) {
  SkipBlanks(text);
  while (text.starts_with('\\')) {
    text.remove_prefix(1);
    SkipBlanks(text);
    if (!TakeWord(text, "\r\n")) {
      TakeWord(text, "\n");
    }
    SkipBlanks(text);
  }
}

// One or two hexadecimal digits for each byte, with commas between them; possibly none at all.
std::optional<std::string> TakeHexBytes(std::string_view& text) {
  std::string bytes;
  SkipBlanksAndJoints(text);
  bool isByteDue = false;
  while (const std::optional<uint32_t> byte = TakeHexNumber(text)) {
    if (*byte > 0xFF) {
      return std::nullopt;
    }
    bytes += static_cast<char>(*byte);
    SkipBlanksAndJoints(text);
    isByteDue = TakeWord(text, ",");
    if (!isByteDue) {
      break;
    }
    SkipBlanksAndJoints(text);
  }
  return isByteDue ? std::nullopt : std::optional(std::move(bytes));
}

// The kind of value that "hex" or "hex(N)" names, up to the colon.
std::optional<uint32_t> TakeHexType(std::string_view& text) {
  uint32_t type = typeBinary;
  if (TakeWord(text, "(")) {
    const std::optional<uint32_t> number = TakeHexNumber(text);
    if (!number || !TakeWord(text, ")")) {
      return std::nullopt;
    }
    type = *number;
  }
  return TakeWord(text, ":") ? std::optional(type) : std::nullopt;
}

std::optional<RegistryData> TakeHexData(std::string_view& text, HexText hexText) {
  const std::optional<uint32_t> type = TakeHexType(text);
  if (!type) {
    return std::nullopt;
  }
  std::optional<std::string> bytes = TakeHexBytes(text);
  if (!bytes) {
    return std::nullopt;
  }
  const bool isText =
      *type == kRegistryText || *type == typeExpandableText || *type == typeMultipleText;
  if (!isText || hexText == HexText::kNarrow) {
    return RegistryData{*type, std::move(*bytes)};
  }
  RegistryData data{*type, ""};
  AppendNarrowed(data.Bytes, *bytes);
  return data;
}

std::optional<RegistryData> TakeNumberData(std::string_view& text) {
  SkipBlanks(text);
  const std::optional<uint32_t> number = TakeHexNumber(text);
  if (!number) {
    return std::nullopt;
  }
  RegistryData data{kRegistryNumber, ""};
  for (int bits = 0; bits < 32; bits += 8) {
    data.Bytes += static_cast<char>(*number >> bits & 0xFF);
  }
  return data;
}

std::optional<RegistryData> TakeData(std::string_view& text, HexText hexText) {
  if (TakeWord(text, "dword:")) {
    return TakeNumberData(text);
  }
  if (TakeWord(text, "hex")) {
    return TakeHexData(text, hexText);
  }
  std::optional<std::string> quoted = TakeQuoted(text);
  if (!quoted) {
    return std::nullopt;
  }
  return RegistryData{kRegistryText, std::move(*quoted) + '\0'};
}

// The name of a value: "@" is the one without a name.
std::optional<std::string> TakeName(std::string_view& text) {
  return TakeWord(text, "@") ? std::optional(std::string()) : TakeQuoted(text);
}

std::optional<ValueLine> TakeValueLine(std::string_view& text, HexText hexText) {
  std::optional<std::string> name = TakeName(text);
  if (!name) {
    return std::nullopt;
  }
  SkipBlanks(text);
  if (!TakeWord(text, "=")) {
    return std::nullopt;
  }
  SkipBlanks(text);
  ValueLine line{std::move(*name), std::nullopt};
  if (!TakeWord(text, "-")) {
    line.Data = TakeData(text, hexText);
    if (!line.Data) {
      return std::nullopt;
    }
  }
  return TakeLineEnd(text) ? std::optional(std::move(line)) : std::nullopt;
}

}  // namespace

void ReadValueLines(std::string_view lines, HexText hexText, RegistryValues& values) {
  while (true) {
    SkipBlanks(lines);
    if (lines.empty() || lines.front() == '[') {
      return;
    }
    std::string_view text = lines;
    std::optional<ValueLine> line = TakeValueLine(text, hexText);
    if (!line) {
      SkipLine(lines);
      continue;
    }
    lines = text;
    if (line->Data) {
      values.FindOrAdd(line->Name) = std::move(*line->Data);
    } else {
      values.Remove(line->Name);
    }
  }
}
