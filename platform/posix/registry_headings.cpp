#include "platform/posix/registry_headings.h"

#include <algorithm>
#include <utility>

#include "platform/ascii_case.h"

namespace {

bool TakePrefix(std::string_view& text, std::string_view prefix) {
  // Nearly all are written alike.
  if (!text.starts_with(prefix) && !EqualsIgnoringCase(text.substr(0, prefix.size()), prefix)) {
    return false;
  }
  text.remove_prefix(prefix.size());
  return true;
}

// Whether only blanks stand between the begin of the line and a place in it.
bool IsFirstInLine(std::string_view bytes, ExportEncoding encoding, size_t at) {
  const size_t width = CharacterWidth(encoding);
  const auto isBehind = [&](char c) { return HasCharacterAt(bytes, encoding, at - width, c); };
  while (at > 0 && (isBehind(' ') || isBehind('\t'))) {
    at -= width;
  }
  return at == 0 || isBehind('\n');
}

}  // namespace

ExportFormat ReadFormat(const ByteReader& read) {
  constexpr std::string_view utf16Mark = "\xFF\xFE";
  constexpr std::string_view utf8Mark = "\xEF\xBB\xBF";
  char begin[64];
  const std::string_view bytes(begin, read(0, begin, sizeof begin));
  ExportFormat format;
  if (bytes.starts_with(utf16Mark)) {
    format.Encoding = ExportEncoding::kUtf16;
    format.Begin = utf16Mark.size();
  } else if (bytes.starts_with(utf8Mark)) {
    format.Begin = utf8Mark.size();
  }
  std::string buffer;
  const std::string_view text = Decoded(bytes.substr(format.Begin), format.Encoding, buffer);
  format.HexForm = text.starts_with("REGEDIT4") ? HexText::kNarrow : HexText::kUtf16;
  return format;
}

RegistryHeadings::RegistryHeadings(ByteReader read, ExportEncoding encoding)
    : Encoding(encoding), Pieces(std::move(read), encoding) {}

uint64_t RegistryHeadings::Visit(uint64_t begin, uint64_t end, const Visitor& visitor) {
  Pieces.Start(begin, end);
  while (Pieces.Next()) {
    VisitPiece(visitor);
  }
  return Pieces.Offset();
}

void RegistryHeadings::VisitPiece(const Visitor& visitor) {
  const std::string_view bytes = Pieces.Bytes();
  // Only the first bracket of a line can begin a heading, so that no line is looked at twice.
  size_t lineEnd = Pieces.IsLineBegun() ? FindCharacter(bytes, Encoding, '\n', 0) : 0;
  while (true) {
    const size_t at = FindCharacter(bytes, Encoding, '[', lineEnd);
    if (at == std::string_view::npos) {
      return;
    }
    lineEnd = std::min(FindCharacter(bytes, Encoding, '\n', at), bytes.size());
    if (IsFirstInLine(bytes, Encoding, at)) {
      VisitLine(bytes.substr(at, lineEnd - at), Pieces.Offset() + at, visitor);
    }
  }
}

void RegistryHeadings::VisitLine(std::string_view line, uint64_t offset, const Visitor& visitor) {
  std::string_view text = Decoded(line, Encoding, LineBuffer);
  TakePrefix(text, "[");
  const HeadingKind kind = TakePrefix(text, "-") ? HeadingKind::kRemoval : HeadingKind::kKey;
  // Within a text of several lines, others may begin with a bracket.
  if (!TakePrefix(text, "HKEY_")) {
    return;
  }
  const size_t close = text.rfind(']');
  text = text.substr(0, close);
  if (close == std::string_view::npos || !TakePrefix(text, "LOCAL_MACHINE") ||
      (!text.empty() && !TakePrefix(text, "\\"))) {
    visitor({HeadingKind::kOther, "", offset});
    return;
  }
  if (text.ends_with('\\')) {  // some exporters end the path of a hive so
    text.remove_suffix(1);
  }
  visitor({kind, text, offset});
}
