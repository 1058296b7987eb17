#include "platform/posix/registry_headings.h"

#include <algorithm>

#include "platform/ascii_case.h"

namespace {

constexpr std::string_view utf16Mark = "\xFF\xFE";
constexpr std::string_view utf8Mark = "\xEF\xBB\xBF";

bool TakePrefix(std::string_view& text, std::string_view prefix) {
  if (!EqualsIgnoringCase(text.substr(0, prefix.size()), prefix)) {
    return false;
  }
  text.remove_prefix(prefix.size());
  return true;
}

// Whether only blanks stand between the begin of the line and a place in it.
bool IsFirstInLine(std::string_view bytes, size_t at, size_t width) {
  while (at >= width && (bytes[at - width] == ' ' || bytes[at - width] == '\t')) {
    at -= width;
  }
  return at < width || bytes[at - width] == '\n';
}

}  // namespace

RegistryHeadings::RegistryHeadings(const ByteReader& read) {
  char begin[64];
  const std::string_view bytes(begin, read(0, begin, sizeof begin));
  size_t markSize = 0;
  if (bytes.starts_with(utf16Mark)) {
    FileEncoding = ExportEncoding::kUtf16;
    markSize = utf16Mark.size();
  } else if (bytes.starts_with(utf8Mark)) {
    markSize = utf8Mark.size();
  }
  AppendDecoded(DecodedLine, bytes.substr(markSize), FileEncoding);
  FileHexForm = DecodedLine.starts_with("REGEDIT4") ? HexText::kNarrow : HexText::kUtf16;

  RegistryPieces pieces(read, FileEncoding, markSize);
  while (pieces.Next()) {
    const size_t from =
        pieces.IsLineBegun() ? FindCharacter(pieces.Bytes(), FileEncoding, '\n', 0) : 0;
    ScanLines(pieces.Bytes(), pieces.Offset(), from);
  }
  FileEnd = pieces.Offset();
}

RegistryHeading RegistryHeadings::At(size_t index) const {
  const Place& place = Places[index];
  const bool isLast = index + 1 == Places.size();
  const size_t recordEnd = isLast ? Records.size() : Places[index + 1].Record;
  const std::string_view record(Records.data() + place.Record, recordEnd - place.Record);
  return {static_cast<HeadingKind>(record.front()), record.substr(1), place.Begin,
          isLast ? FileEnd : Places[index + 1].Begin};
}

void RegistryHeadings::ScanLines(std::string_view bytes, uint64_t offset, size_t from) {
  // Only the first bracket of a line can begin a heading, so that no line is looked at twice.
  size_t at = FindCharacter(bytes, FileEncoding, '[', from);
  while (at != std::string_view::npos) {
    const size_t end = std::min(FindCharacter(bytes, FileEncoding, '\n', at), bytes.size());
    if (IsFirstInLine(bytes, at, CharacterWidth(FileEncoding))) {
      AddHeading(bytes.substr(at, end - at), offset + at);
    }
    at = FindCharacter(bytes, FileEncoding, '[', end);
  }
}

void RegistryHeadings::AddHeading(std::string_view line, uint64_t offset) {
  DecodedLine.clear();
  AppendDecoded(DecodedLine, line, FileEncoding);
  std::string_view text = DecodedLine;
  TakePrefix(text, "[");
  const HeadingKind kind = TakePrefix(text, "-") ? HeadingKind::kRemoval : HeadingKind::kKey;
  // Other lines may begin with a bracket within a text of several lines.
  if (!EqualsIgnoringCase(text.substr(0, 5), "HKEY_")) {
    return;
  }
  const size_t close = text.rfind(']');
  text = text.substr(0, close);
  if (close == std::string_view::npos || !TakePrefix(text, "HKEY_LOCAL_MACHINE") ||
      (!text.empty() && !TakePrefix(text, "\\"))) {
    AddRecord(HeadingKind::kOther, "", offset);
    return;
  }
  AddRecord(kind, text, offset);
}

void RegistryHeadings::AddRecord(HeadingKind kind, std::string_view path, uint64_t offset) {
  Places.push_back({offset, Records.size()});
  Records += static_cast<char>(kind);
  Records += path;
}
