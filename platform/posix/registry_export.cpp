#include "platform/posix/registry_export.h"

#include <algorithm>
#include <utility>

namespace {

// The part of the registry to lay out for a question: all that has the same parent as the key, so
// that the keys beside it are there too, but never more than one maker's part.
std::string TopFor(const std::string& keyPath) {
  const size_t first = keyPath.find('\\');
  const size_t last = keyPath.rfind('\\');
  return first == last ? keyPath : keyPath.substr(0, last);
}

std::vector<std::string> NamesThatFit(std::vector<std::string> names) {
  constexpr size_t longest = 255;
  const auto end = std::find_if(names.begin(), names.end(),
                                [](const std::string& name) { return name.size() > longest; });
  names.erase(end, names.end());
  return names;
}

}  // namespace

RegistryExport::RegistryExport(ByteReader read) : ReadBytes(std::move(read)) {}

RegistryTree& RegistryExport::BranchOf(const std::string& keyPath) {
  for (const std::unique_ptr<RegistryTree>& branch : Branches) {
    if (IsAtOrBelow(keyPath, branch->Top())) {
      return *branch;
    }
  }
  if (!Headings) {
    Headings = std::make_unique<RegistryHeadings>(ReadBytes);
  }
  Branches.push_back(std::make_unique<RegistryTree>(*Headings, TopFor(keyPath)));
  return *Branches.back();
}

RegistryValues* RegistryExport::ValuesOf(const std::string& keyPath) {
  RegistryTree::Key* key = BranchOf(keyPath).Find(keyPath);
  if (key == nullptr) {
    return nullptr;
  }
  if (!key->Values) {
    key->Values = std::make_unique<RegistryValues>();
    for (const RegistryHeading& heading : key->Headings) {
      ReadLines(heading, *key->Values);
    }
  }
  return key->Values.get();
}

void RegistryExport::ReadLines(const RegistryHeading& heading, RegistryValues& values) const {
  const auto size = static_cast<size_t>(heading.End - heading.Begin);
  const auto bytes = std::make_unique_for_overwrite<char[]>(size);
  const size_t got = ReadBytes(heading.Begin, bytes.get(), size);
  std::string text;
  AppendDecoded(text, {bytes.get(), got}, Headings->Encoding());
  const size_t headingEnd = std::min(text.find('\n'), text.size());
  ReadValueLines(std::string_view(text).substr(headingEnd), Headings->HexForm(), values);
}

RegistryData RegistryExport::Read(const std::string& keyPath, const std::string& valueName,
                                  size_t limit) {
  RegistryValues* values = ValuesOf(keyPath);
  const RegistryData* data = values == nullptr ? nullptr : values->Find(valueName);
  if (data == nullptr) {
    return {};
  }
  return data->Bytes.size() > limit ? RegistryData{data->Type, ""} : *data;
}

std::vector<std::string> RegistryExport::ValueNames(const std::string& keyPath) {
  const RegistryValues* values = ValuesOf(keyPath);
  return values == nullptr ? std::vector<std::string>() : NamesThatFit(values->Names());
}

std::vector<std::string> RegistryExport::SubKeyNames(const std::string& keyPath) {
  const RegistryTree::Key* key = BranchOf(keyPath).Find(keyPath);
  return key == nullptr ? std::vector<std::string>() : NamesThatFit(key->SubKeys.Names());
}
