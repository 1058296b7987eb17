#include "platform/posix/registry_pieces.h"

#include <algorithm>
#include <cstring>
#include <utility>

static constexpr size_t pieceSize = size_t{1} << 18;
static constexpr size_t longestLine = size_t{1} << 22;

RegistryPieces::RegistryPieces(ByteReader read, ExportEncoding encoding, uint64_t begin)
    : Read(std::move(read)),
      Encoding(encoding),
      Buffer(std::make_unique_for_overwrite<char[]>(longestLine)),
      BufferOffset(begin) {}

bool RegistryPieces::Next() {
  Filled -= Given;
  std::memmove(Buffer.get(), Buffer.get() + Given, Filled);
  BufferOffset += Given;
  IsWithinLine = IsNextWithinLine;
  while (!IsAtEnd && Filled < longestLine) {
    const size_t before = Filled;
    const size_t wanted = std::min(pieceSize, longestLine - before);
    const size_t got = Read(BufferOffset + before, Buffer.get() + before, wanted);
    IsAtEnd = got < wanted;
    Filled += got;
    const std::string_view added(Buffer.get() + before, got);
    const size_t lineEnd = FindLastCharacter(added, Encoding, '\n');
    if (lineEnd != std::string_view::npos) {
      Given = before + lineEnd + CharacterWidth(Encoding);
      IsNextWithinLine = false;
      return true;
    }
  }
  Given = Filled;
  IsNextWithinLine = true;
  return Given > 0;
}
