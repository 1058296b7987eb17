#include "platform/posix/registry_export.h"

#include <algorithm>
#include <utility>

#include "platform/ascii_case.h"
#include "platform/posix/registry_path.h"

namespace {

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
    Format = ReadFormat(ReadBytes);
    Headings.emplace(ReadBytes, Format.Encoding);
    Map = MapRegistry(*Headings, Format.Begin);
  }
  Branches.push_back(std::make_unique<RegistryTree>(*Headings, Map, TopFor(keyPath)));
  return *Branches.back();
}

// One key is laid out with what lies below it. With the second key of a parent come all the others
// of that parent, as they are likely to be asked for one by one; but never a whole hive.
std::string RegistryExport::TopFor(const std::string& keyPath) const {
  const std::string_view parent = ParentOf(keyPath);
  const bool isSecond = std::any_of(Branches.begin(), Branches.end(),
                                    [&](const std::unique_ptr<RegistryTree>& branch) {
                                      return EqualsIgnoringCase(ParentOf(branch->Top()), parent);
                                    });
  return isSecond && !ParentOf(parent).empty() ? std::string(parent) : keyPath;
}

RegistryValues* RegistryExport::ValuesOf(const std::string& keyPath) {
  RegistryTree::Key* key = BranchOf(keyPath).Find(keyPath);
  if (key == nullptr) {
    return nullptr;
  }
  if (!key->Values) {
    key->Values = std::make_unique<RegistryValues>();
    for (const RegistryTree::Lines& lines : key->Places) {
      ReadLines(lines, *key->Values);
    }
  }
  return key->Values.get();
}

void RegistryExport::ReadLines(const RegistryTree::Lines& lines, RegistryValues& values) const {
  const auto size = static_cast<size_t>(lines.End - lines.Begin);
  const auto bytes = std::make_unique_for_overwrite<char[]>(size);
  const size_t got = ReadBytes(lines.Begin, bytes.get(), size);
  std::string buffer;
  const std::string_view text = Decoded({bytes.get(), got}, Format.Encoding, buffer);
  const size_t headingEnd = std::min(text.find('\n'), text.size());
  ReadValueLines(text.substr(headingEnd), Format.HexForm, values);
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
