#include "reader/html.h"

#include <algorithm>
#include <cstdint>
#include <cstdio>

namespace {

struct CodePoints {
  uint32_t First;
  uint32_t Last;
};

// Shown by number: controls, and what is invisible or changes the direction of the text around it.
constexpr CodePoints numbered[] = {
    {0x00, 0x1F},     {0x7F, 0x9F},     {0xAD, 0xAD},     {0x61C, 0x61C},     {0x200B, 0x200F},
    {0x2028, 0x202E}, {0x2060, 0x206F}, {0xFEFF, 0xFEFF}, {0xE0000, 0xE007F},
};

bool IsNumbered(uint32_t codePoint) {
  return std::any_of(std::begin(numbered), std::end(numbered),
                     [codePoint](const CodePoints& range) {
                       return codePoint >= range.First && codePoint <= range.Last;
                     });
}

// The length in bytes of the sequence that this byte begins.
size_t SequenceLength(char first) {
  const auto byte = static_cast<unsigned char>(first);
  return byte < 0xC0 ? 1 : byte < 0xE0 ? 2 : byte < 0xF0 ? 3 : 4;
}

uint32_t CodePointOf(std::string_view sequence) {
  const auto first = static_cast<unsigned char>(sequence[0]);
  uint32_t codePoint = sequence.size() == 1 ? first : first & (0x7FU >> sequence.size());
  for (const char next : sequence.substr(1)) {
    codePoint = codePoint << 6 | (static_cast<unsigned char>(next) & 0x3FU);
  }
  return codePoint;
}

std::string_view EntityOf(char c) {
  switch (c) {
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
  for (size_t i = 0; i < text.size();) {
    const std::string_view sequence = text.substr(i, SequenceLength(text[i]));
    i += sequence.size();
    if (const uint32_t codePoint = CodePointOf(sequence); IsNumbered(codePoint)) {
      char number[16] = {};
      std::snprintf(number, sizeof number, "[U+%04X]", codePoint);
      html += number;
      continue;
    }
    const std::string_view entity = EntityOf(sequence[0]);
    html += entity.empty() ? sequence : entity;
  }
  return html;
}
