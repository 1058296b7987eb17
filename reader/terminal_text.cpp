#include "reader/terminal_text.h"

#include <algorithm>
#include <iterator>

#include "platform/utf8.h"

namespace {

struct Range {
  char32_t First, Last;
};

constexpr Range kObeyed[] = {{0x00, 0x1F},     {0x7F, 0x9F},     {0x061C, 0x061C},
                             {0x200E, 0x200F}, {0x2028, 0x202E}, {0x2066, 0x2069}};
constexpr Range kWide[] = {{0x1100, 0x115F},   {0x2E80, 0x303E},  {0x3041, 0xA4CF},
                           {0xAC00, 0xD7A3},   {0xF900, 0xFAFF},  {0xFE30, 0xFE6F},
                           {0xFF00, 0xFF60},   {0xFFE0, 0xFFE6},  {0x1F300, 0x1F64F},
                           {0x1F900, 0x1FAFF}, {0x20000, 0x3FFFD}};
constexpr Range kCombining[] = {{0x0300, 0x036F}, {0x0483, 0x0489}, {0x0591, 0x05BD},
                                {0x064B, 0x065F}, {0x200B, 0x200D}, {0x20D0, 0x20FF},
                                {0xFE00, 0xFE0F}, {0xFE20, 0xFE2F}};

template <size_t count>
bool IsIn(const Range (&ranges)[count], char32_t character) {
  return std::any_of(std::begin(ranges), std::end(ranges), [character](const Range& range) {
    return character >= range.First && character <= range.Last;
  });
}

size_t ColumnsOfCharacter(char32_t character) {
  return IsIn(kCombining, character) ? 0 : IsIn(kWide, character) ? 2 : 1;
}

}  // namespace

std::string Painted(std::string_view text, Colour colour, const ViewOptions& options) {
  if (!options.HasColours || colour == Colour::kPlain) {
    return std::string(text);
  }
  const char* codes[] = {"0", "31", "32", "33", "35", "1"};
  std::string painted("\x1B[");
  return painted.append(codes[static_cast<size_t>(colour)])
      .append("m")
      .append(text)
      .append("\x1B[0m");
}

std::string Printable(std::string_view text) {
  std::string result;
  result.reserve(text.size());
  while (!text.empty()) {
    const std::string_view before = text;
    const char32_t character = TakeCharacter(text);
    if (!IsIn(kObeyed, character)) {
      result += before.substr(0, before.size() - text.size());
    } else {
      result += character == '\t' || character == '\n' || character == '\r' ? ' ' : '?';
    }
  }
  return result;
}

size_t ColumnsOf(std::string_view text) {
  size_t columns = 0;
  while (!text.empty()) {
    columns += ColumnsOfCharacter(TakeCharacter(text));
  }
  return columns;
}

std::string PaddedTo(std::string_view text, size_t columns) {
  const size_t used = ColumnsOf(text);
  return std::string(text) + std::string(used < columns ? columns - used : 0, ' ');
}

std::string CutTo(std::string_view text, size_t columns) {
  if (ColumnsOf(text) <= columns) {
    return std::string(text);
  }
  std::string_view rest = text;
  size_t used = 1;  // for the mark
  size_t kept = 0;
  while (!rest.empty()) {
    used += ColumnsOfCharacter(TakeCharacter(rest));
    if (used > columns) {
      break;
    }
    kept = text.size() - rest.size();
  }
  return std::string(text.substr(0, kept)) + "\u2026";
}
