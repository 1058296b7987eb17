#include "platform/posix/registry_pieces.h"

#include <algorithm>
#include <cstring>
#include <utility>

static constexpr size_t pieceSize = size_t{1} << 18;
static constexpr size_t longestLine = size_t{1} << 20;

RegistryPieces::RegistryPieces(ByteReader read, ExportEncoding encoding)
    : Read(std::move(read)),
      Encoding(encoding),
      Buffer(std::make_unique_for_overwrite<char[]>(longestLine)) {}

void RegistryPieces::Start(uint64_t begin, uint64_t end) {
  BufferOffset = begin;
  End = end;
  Filled = 0;
  Given = 0;
  IsNextWithinLine = false;
}

bool RegistryPieces::Next() {
  Filled -= Given;
  std::memmove(Buffer.get(), Buffer.get() + Given, Filled);
  BufferOffset += Given;
  Given = 0;
  IsWithinLine = IsNextWithinLine;
  IsNextWithinLine = !FillUpToLineEnd();
  if (IsNextWithinLine) {
    Given = Filled;
  }
  return Given > 0;
}

// Reads on until the buffer holds a line's end, which makes it a piece. False at the end of the
// stretch and for a line that is too long.
bool RegistryPieces::FillUpToLineEnd() {
  while (true) {
    const size_t room = std::min(pieceSize, longestLine - Filled);
    const uint64_t place = BufferOffset + Filled;
    const auto wanted = static_cast<size_t>(std::min<uint64_t>(room, End - std::min(End, place)));
    const size_t got = wanted == 0 ? 0 : Read(place, Buffer.get() + Filled, wanted);
    if (got == 0) {
      return false;
    }
    const std::string_view added(Buffer.get() + Filled, got);
    const size_t lineEnd = FindLastCharacter(added, Encoding, '\n');
    Filled += got;
    if (lineEnd != std::string_view::npos) {
      Given = Filled - got + lineEnd + CharacterWidth(Encoding);
      return true;
    }
  }
}
