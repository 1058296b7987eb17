#include "platform/posix/registry/headings.h"

#include <memory>
#include <optional>
#include <string>

#include "platform/ascii_case.h"

namespace {

bool IsFirstInLine(std::string_view bytes, size_t width, size_t at) {
  const auto isBefore = [&](char c) { return HasCharacterAt(bytes, width, at - width, c); };
  while (at > 0 && (isBefore(' ') || isBefore('\t'))) {
    at -= width;
  }
  return at == 0 || isBefore('\n');
}

// The offset after the last line end; 0 if there is none.
size_t LastLineEnd(std::string_view bytes, size_t width) {
  size_t size = bytes.rfind('\n') + 1;
  while (size > 0 && (size % width != 1 % width || !HasCharacterAt(bytes, width, size - 1, '\n'))) {
    size = bytes.substr(0, size - 1).rfind('\n') + 1;
  }
  return size == 0 ? 0 : size - 1 + width;
}

// Nothing for another bracket, as a text of several lines may contain.
std::optional<RegistryHeading> ParseHeading(std::string_view line) {
  TakePrefixIgnoringCase(line, "[");
  const bool isRemoval = TakePrefixIgnoringCase(line, "-");
  if (!TakePrefixIgnoringCase(line, "HKEY_")) {
    return std::nullopt;
  }
  const size_t close = line.rfind(']');
  line = line.substr(0, close);
  if (close == std::string_view::npos || !TakePrefixIgnoringCase(line, "LOCAL_MACHINE") ||
      (!line.empty() && !TakePrefixIgnoringCase(line, "\\"))) {
    return RegistryHeading();
  }
  // Some exporters end the path of a hive with a backslash.
  const std::string_view path = line.substr(0, line.size() - (line.ends_with('\\') ? 1 : 0));
  return RegistryHeading{isRemoval ? HeadingKind::kRemoval : HeadingKind::kKey, path};
}

}  // namespace

uint32_t VisitHeadings(const ByteReader& read, const ExportFormat& format,
                       const std::function<void(const RegistryHeading&)>& visitor) {
  constexpr size_t bufferSize = size_t{512} << 10;
  const auto buffer = std::make_unique_for_overwrite<char[]>(bufferSize);
  std::string lineBuffer;
  const size_t width = format.CharacterWidth;
  uint64_t offset = format.Begin;
  bool startsMidLine = false;
  for (size_t got = bufferSize; got == bufferSize;) {
    got = read(offset, buffer.get(), bufferSize);
    const std::string_view all(buffer.get(), got);
    const size_t lastLineEnd = LastLineEnd(all, width);
    // Complete lines, except at the end of the export; no part of one longer than the buffer.
    const std::string_view lines = all.substr(0, got == bufferSize ? lastLineEnd : got);
    size_t at = startsMidLine ? FindCharacter(lines, width, '\n', 0) : 0;
    while ((at = FindCharacter(lines, width, '[', at)) < lines.size()) {
      const size_t begin = at;
      at = FindCharacter(lines, width, '\n', begin);
      if (!IsFirstInLine(lines, width, begin)) {
        continue;
      }
      const std::string_view line = lines.substr(begin, at - begin);
      if (auto heading = ParseHeading(Decoded(line, width, lineBuffer))) {
        heading->Begin = static_cast<uint32_t>(offset + begin);
        visitor(*heading);
      }
    }
    startsMidLine = lines.empty();
    offset += startsMidLine ? got : lines.size();
  }
  return static_cast<uint32_t>(offset);
}
