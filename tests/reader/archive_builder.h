#pragma once

#include <zlib.h>

#include <cstdint>
#include <string>
#include <vector>

// Writes zip archives as any tool could have made them, and such as no tool makes.

struct BuiltEntry {
  std::string Name;
  std::string Text;
  uint32_t Attributes = 0;  // external; 0x10 for a folder
  uint16_t Flags = 0;       // 1 for encrypted
  uint16_t Method = 0;      // 8 for deflate
  int64_t SizeLie = 0;      // added to the size that the directory states
};

inline std::string Number(uint64_t number, size_t bytes) {
  std::string text;
  for (size_t i = 0; i < bytes; ++i) {
    text += static_cast<char>(number >> (8 * i));
  }
  return text;
}

// What compress() writes between a head of two bytes and a checksum of four.
inline std::string Deflated(const std::string& text) {
  uLongf size = compressBound(static_cast<uLong>(text.size()));
  std::string packed(size, '\0');
  compress(reinterpret_cast<Bytef*>(packed.data()), &size,
           reinterpret_cast<const Bytef*>(text.data()), static_cast<uLong>(text.size()));
  return packed.substr(2, size - 6);
}

// The count that the end record states is that of the entries and the lie.
inline std::string BuildArchive(const std::vector<BuiltEntry>& entries, int64_t countLie = 0) {
  std::string bytes;
  std::string directory;
  for (const BuiltEntry& entry : entries) {
    const std::string data = entry.Method == Z_DEFLATED ? Deflated(entry.Text) : entry.Text;
    const auto crc = crc32(0, reinterpret_cast<const Bytef*>(entry.Text.data()),
                           static_cast<uInt>(entry.Text.size()));
    const auto size =
        static_cast<uint64_t>(static_cast<int64_t>(entry.Text.size()) + entry.SizeLie);
    const std::string common = Number(20, 2) + Number(entry.Flags, 2) + Number(entry.Method, 2) +
                               Number(0, 4) + Number(crc, 4) + Number(data.size(), 4) +
                               Number(size, 4) + Number(entry.Name.size(), 2) + Number(0, 2);
    directory += "PK\x01\x02" + Number(20, 2) + common + Number(0, 6) +
                 Number(entry.Attributes, 4) + Number(bytes.size(), 4) + entry.Name;
    bytes += "PK\x03\x04" + common + entry.Name + data;
  }
  const auto count = static_cast<uint64_t>(static_cast<int64_t>(entries.size()) + countLie);
  return bytes + directory + "PK\x05\x06" + Number(0, 4) + Number(count, 2) + Number(count, 2) +
         Number(directory.size(), 4) + Number(bytes.size(), 4) + Number(0, 2);
}
