#include "reader/archive_stream.h"

#include <algorithm>
#include <cstring>

zlib_filefunc64_def Archive::Stream::Functions() {
  zlib_filefunc64_def functions = {};
  functions.opaque = this;
  functions.zopen64_file = [](voidpf opaque, const void*, int) -> voidpf { return opaque; };
  functions.zread_file = [](voidpf opaque, voidpf, void* buffer, uLong size) -> uLong {
    return static_cast<uLong>(static_cast<Stream*>(opaque)->Read(static_cast<char*>(buffer), size));
  };
  functions.zwrite_file = [](voidpf, voidpf, const void*, uLong) -> uLong { return 0; };
  functions.ztell64_file = [](voidpf opaque, voidpf) -> ZPOS64_T {
    return static_cast<Stream*>(opaque)->Offset;
  };
  functions.zseek64_file = [](voidpf opaque, voidpf, ZPOS64_T offset, int origin) -> long {
    return static_cast<Stream*>(opaque)->Seek(offset, origin) ? 0 : -1;
  };
  functions.zclose_file = [](voidpf, voidpf) -> int { return 0; };
  functions.zerror_file = [](voidpf, voidpf) -> int { return 0; };
  return functions;
}

size_t Archive::Stream::Read(char* buffer, size_t size) {
  size_t done = 0;
  while (done < size) {
    if (Offset < WindowOffset || Offset >= WindowOffset + WindowSize) {
      WindowOffset = Offset;
      WindowSize = Bytes.ReadAt(Offset, Window.data(), Window.size());
      if (WindowSize == 0) {
        break;
      }
    }
    const auto begin = static_cast<size_t>(Offset - WindowOffset);
    const size_t count = std::min(size - done, WindowSize - begin);
    std::memcpy(buffer + done, Window.data() + begin, count);
    done += count;
    Offset += count;
  }
  return done;
}

bool Archive::Stream::Seek(uint64_t offset, int origin) {
  const uint64_t base = origin == ZLIB_FILEFUNC_SEEK_CUR   ? Offset
                        : origin == ZLIB_FILEFUNC_SEEK_END ? Bytes.Size
                                                           : 0;
  const uint64_t target = base + offset;
  if (target < base || target > Bytes.Size) {
    return false;
  }
  Offset = target;
  return true;
}
