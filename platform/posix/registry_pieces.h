#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string_view>

#include "platform/posix/registry_text.h"

// Fills the buffer with the bytes from an offset on and gives how many there were: fewer than its
// size only at the end, or where reading fails.
using ByteReader = std::function<size_t(uint64_t offset, char* buffer, size_t size)>;

// Goes through stretches of encoded text, in pieces of whole lines that are small enough to stay in
// the processor's cache. Only a line of 1 MiB or more comes in several pieces.
class RegistryPieces {
 public:
  RegistryPieces(ByteReader read, ExportEncoding encoding);

  // Starts at a line's begin; the stretch ends at the text's end if that comes first.
  void Start(uint64_t begin, uint64_t end);

  // Goes on to the next piece; false at the end.
  bool Next();

  std::string_view Bytes() const { return {Buffer.get(), Given}; }
  uint64_t Offset() const { return BufferOffset; }   // of the piece; at the end, the stretch's end
  bool IsLineBegun() const { return IsWithinLine; }  // the piece begins within a line

 private:
  bool FillUpToLineEnd();

  ByteReader Read;
  ExportEncoding Encoding;
  std::unique_ptr<char[]> Buffer;
  uint64_t BufferOffset = 0;
  uint64_t End = 0;
  size_t Filled = 0;
  size_t Given = 0;  // of the bytes filled, those that are the present piece
  bool IsWithinLine = false;
  bool IsNextWithinLine = false;
};
