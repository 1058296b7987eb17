#include "reader/html.h"

#include <algorithm>
#include <cstdio>

#include "platform/utf8.h"

namespace {

struct CodePoints {
  char32_t First;
  char32_t Last;
};

// Shown by number: controls, and what is invisible or changes the direction of the text around it.
constexpr CodePoints numbered[] = {
    {0x00, 0x1F},     {0x7F, 0x9F},     {0xAD, 0xAD},     {0x61C, 0x61C},     {0x200B, 0x200F},
    {0x2028, 0x202E}, {0x2060, 0x206F}, {0xFEFF, 0xFEFF}, {0xE0000, 0xE007F},
};

bool IsNumbered(char32_t codePoint) {
  return std::any_of(std::begin(numbered), std::end(numbered),
                     [codePoint](const CodePoints& range) {
                       return codePoint >= range.First && codePoint <= range.Last;
                     });
}

std::string_view EntityOf(char32_t codePoint) {
  switch (codePoint) {
    case '&':
      return "&amp;";
    case '<':
      return "&lt;";
    case '>':
      return "&gt;";
    case '"':
      return "&quot;";
    case '\'':
      return "&#39;";
    default:
      return "";
  }
}

}  // namespace

std::string EscapeHtml(std::string_view text) {
  std::string html;
  html.reserve(text.size());
  while (!text.empty()) {
    const std::string_view before = text;
    const char32_t codePoint = TakeCharacter(text);
    if (IsNumbered(codePoint)) {
      char number[16] = {};
      std::snprintf(number, sizeof number, "[U+%04X]", static_cast<unsigned>(codePoint));
      html += number;
      continue;
    }
    const std::string_view entity = EntityOf(codePoint);
    html += entity.empty() ? before.substr(0, before.size() - text.size()) : entity;
  }
  return html;
}
