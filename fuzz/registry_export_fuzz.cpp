#include <algorithm>
#include <cstdint>
#include <string>
#include <vector>

#include "fuzz/require.h"
#include "platform/posix/registry_export.h"

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

std::string AsUtf16(const std::string& ascii) {
  std::string wide = "\xFF\xFE";
  for (const char c : ascii) {
    wide += c;
    wide += '\0';
  }
  return wide;
}

bool IsAscii(const std::string& bytes) {
  return std::all_of(bytes.begin(), bytes.end(),
                     [](char c) { return static_cast<uint8_t>(c) < 0x80; });
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string bytes(data, data + size);
  const std::string tree = Dump(bytes);
  Require(!IsAscii(bytes) || Dump(AsUtf16(bytes)) == tree);
  return 0;
}
