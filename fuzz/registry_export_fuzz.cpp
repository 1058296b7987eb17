#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "fuzz/require.h"
#include "platform/posix/registry/registry_export.h"

// Any bytes as the registry export of the machine: every key and value is asked for, the limits of
// the answers hold, and text reads alike in both encodings.

namespace {

ByteReader ReaderOf(const std::string& bytes) {
  return [&bytes](uint64_t offset, char* buffer, size_t size) {
    return offset < bytes.size() ? bytes.copy(buffer, size, offset) : 0;
  };
}

std::string Dump(const std::string& bytes) {
  RegistryExport registry(ReaderOf(bytes));
  std::string text;
  std::vector<std::string> paths = {""};
  while (!paths.empty()) {
    const std::string path = paths.back();
    paths.pop_back();
    text += "[" + path + "]";
    for (const std::string& name : registry.ValueNames(path)) {
      constexpr size_t limit = 100;
      const RegistryData data = registry.Read(path, name, limit);
      Require(name.size() < 256 && data.Bytes.size() <= limit);
      text += name + "=" + std::to_string(data.Type) + ":" + data.Bytes + "\n";
    }
    for (const std::string& name : registry.SubKeyNames(path)) {
      Require(!name.empty() && name.size() < 256);
      paths.push_back(path.empty() ? name : path + "\\" + name);
    }
  }
  return text;
}

// Takes one character off the text; nothing if it does not begin with one.
std::optional<uint32_t> TakeCharacter(std::string_view& utf8) {
  const auto byteAt = [&](size_t at) -> uint32_t { return static_cast<uint8_t>(utf8[at]); };
  const uint32_t first = byteAt(0);
  const size_t size = first < 0x80 ? 1 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
  if ((first >= 0x80 && first < 0xC2) || first > 0xF4 || utf8.size() < size) {
    return std::nullopt;
  }
  uint32_t character = size == 1 ? first : first & (0x7FU >> size);
  for (size_t i = 1; i < size; ++i) {
    if (byteAt(i) >> 6 != 2) {
      return std::nullopt;
    }
    character = character << 6 | (byteAt(i) & 0x3F);
  }
  constexpr uint32_t lowest[] = {0, 0x80, 0x800, 0x10000};
  const bool isSurrogate = character >= 0xD800 && character < 0xE000;
  if (character < lowest[size - 1] || isSurrogate || character > 0x10FFFF) {
    return std::nullopt;
  }
  utf8.remove_prefix(size);
  return character;
}

void AppendUnit(std::string& utf16, uint32_t unit) {
  utf16 += static_cast<char>(unit & 0xFF);
  utf16 += static_cast<char>(unit >> 8);
}

// The same text in the other encoding; nothing if it is no UTF-8.
std::optional<std::string> AsUtf16(std::string_view utf8) {
  utf8.remove_prefix(utf8.starts_with("\xEF\xBB\xBF") ? 3 : 0);
  std::string wide = "\xFF\xFE";
  while (!utf8.empty()) {
    const std::optional<uint32_t> character = TakeCharacter(utf8);
    if (!character) {
      return std::nullopt;
    }
    if (*character < 0x10000) {
      AppendUnit(wide, *character);
    } else {
      AppendUnit(wide, 0xD800 + ((*character - 0x10000) >> 10));
      AppendUnit(wide, 0xDC00 + ((*character - 0x10000) & 0x3FF));
    }
  }
  return wide;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string bytes(data, data + size);
  const std::string tree = Dump(bytes);
  const std::optional<std::string> wide = AsUtf16(bytes);
  Require(!wide || Dump(*wide) == tree);
  return 0;
}
