#include <cstdint>
#include <exception>
#include <filesystem>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "fuzz/support.h"
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

// The same text in the other encoding; nothing if it is no UTF-8. The conversion accepts
// surrogates.
std::optional<std::string> AsUtf16(std::string_view utf8) {
  utf8.remove_prefix(utf8.starts_with("\xEF\xBB\xBF") ? 3 : 0);
  for (size_t at = 0; (at = utf8.find('\xED', at)) != std::string_view::npos; ++at) {
    if (at + 1 < utf8.size() && static_cast<uint8_t>(utf8[at + 1]) >= 0xA0) {
      return std::nullopt;
    }
  }
  try {
    const std::u16string wide = std::filesystem::path(utf8).u16string();
    return "\xFF\xFE" + std::string(reinterpret_cast<const char*>(wide.data()), 2 * wide.size());
  } catch (const std::exception&) {
    return std::nullopt;
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string bytes(data, data + size);
  const std::string tree = Dump(bytes);
  const std::optional<std::string> wide = AsUtf16(bytes);
  Require(!wide || Dump(*wide) == tree);
  return 0;
}
