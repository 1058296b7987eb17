#include <iconv.h>

#include <optional>

#include "fuzz/support.h"
#include "platform/posix/registry/registry_export.h"

// Any bytes as the registry export of the machine: every key and value is asked for, the limits of
// the answers hold, and text reads alike in both encodings.

namespace {

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

// The same text in the other encoding; nothing if it is no UTF-8.
std::optional<std::string> AsUtf16(std::string_view utf8) {
  static iconv_t const converter = ::iconv_open("UTF-16LE", "UTF-8");
  utf8.remove_prefix(utf8.starts_with("\xEF\xBB\xBF") ? 3 : 0);
  std::string wide(2 * utf8.size(), '\0');
  char* from = const_cast<char*>(utf8.data());  // iconv does not write there
  char* to = wide.data();
  size_t fromLeft = utf8.size();
  size_t toLeft = wide.size();
  const bool isUtf8 = ::iconv(converter, &from, &fromLeft, &to, &toLeft) == 0;
  wide.resize(wide.size() - toLeft);
  return isUtf8 ? std::optional("\xFF\xFE" + wide) : std::nullopt;
}

}  // namespace

void CheckInput(const std::string& input) {
  const std::string tree = Dump(input);
  const std::optional<std::string> wide = AsUtf16(input);
  Require(!wide || Dump(*wide) == tree);
}
