#include "platform/registry.h"

#include <algorithm>
#include <memory>
#include <utility>

#include "platform/known_folders.h"
#include "platform/path.h"
#include "platform/posix/registry/registry_export.h"
#include "platform/shared_file.h"

namespace {

ExportFormat ReadFormat(const ByteReader& read) {
  char begin[64];
  const std::string_view bytes(begin, read(/*offset=*/0, begin, sizeof begin));
  const bool isWide = bytes.starts_with("\xFF\xFE");
  const size_t markSize = isWide ? 2 : bytes.starts_with("\xEF\xBB\xBF") ? 3 : 0;
  ExportFormat format{markSize, isWide ? size_t{2} : size_t{1}};
  std::string buffer;
  const auto text = Decoded(bytes.substr(format.Begin), format.CharacterWidth, buffer);
  format.IsHexTextWide = !text.starts_with("REGEDIT4");
  return format;
}

std::vector<std::string> NamesThatFit(std::vector<std::string> names) {
  const auto isTooLong = [](const std::string& name) { return name.size() > 255; };
  names.erase(std::find_if(names.begin(), names.end(), isTooLong), names.end());
  return names;
}

// A backslash at the end of a path is ignored. What is no path of a key then names one that no
// export has.
std::string_view KeyPathOf(std::string_view path) {
  path.remove_suffix(path.ends_with('\\') ? 1 : 0);
  return IsKeyPath(path) ? path : "\\\\";
}

// The siblings of a key are likely to be queried next. The parent of two names is a hive.
std::string_view BranchTop(std::string_view path) {
  const std::string_view parent = path.substr(0, std::min(path.rfind('\\'), path.size()));
  return parent.find('\\') == std::string_view::npos ? path : parent;
}

// Kept until the process ends, as the interface has free functions and reading the export is slow.
// If the folder changes, as in tests, the registry of the new folder replaces it.
RegistryExport& MachineRegistry() {
  static std::string currentPath;
  static std::optional<RegistryExport> current;
  const std::string path = JoinPath(GetFolderPath(kCommonAppDataFolder), "ZEK/Registry.reg");
  if (path != currentPath) {
    current.emplace([file = std::make_shared<SharedFile>(path, LinkPolicy::kFollow)](
                        uint64_t offset, char* buffer, size_t size) {
      return offset < kLongestExport ? file->ReadAt(offset, buffer, size) : 0;
    });
    currentPath = path;
  }
  return *current;
}

}  // namespace

RegistryExport::RegistryExport(ByteReader read)
    : ReadBytes(std::move(read)), Format(ReadFormat(ReadBytes)) {}

const RegistryBranch& RegistryExport::BranchOf(std::string_view path) {
  for (const RegistryBranch& branch : Branches) {
    if (branch.Covers(path)) {
      return branch;
    }
  }
  return Branches.emplace_back(std::string(BranchTop(path)), ReadBytes, Format);
}

const RegistryValues& RegistryExport::ValuesOf(std::string_view path) {
  if (CurrentKey == path) {
    return CurrentValues;
  }
  CurrentKey = path;
  CurrentValues = RegistryValues();
  for (const auto& [begin, end] : BranchOf(path).SectionsOf(path)) {
    const auto bytes = std::make_unique_for_overwrite<char[]>(end - begin);
    const size_t got = ReadBytes(begin, bytes.get(), end - begin);
    std::string buffer;
    const std::string_view text = Decoded({bytes.get(), got}, Format.CharacterWidth, buffer);
    CurrentValues.AddLines(text.substr(std::min(text.find('\n'), text.size())), Format);
  }
  return CurrentValues;
}

RegistryData RegistryExport::Read(const std::string& keyPath, const std::string& valueName,
                                  size_t limit) {
  const RegistryData* found = ValuesOf(KeyPathOf(keyPath)).Find(valueName);
  const RegistryData data = found == nullptr ? RegistryData() : *found;
  return data.Bytes.size() > limit ? RegistryData{data.Type, ""} : data;
}

std::vector<std::string> RegistryExport::ValueNames(const std::string& keyPath) {
  return NamesThatFit(ValuesOf(KeyPathOf(keyPath)).Names());
}

std::vector<std::string> RegistryExport::SubKeyNames(const std::string& keyPath) {
  const std::string_view path = KeyPathOf(keyPath);
  return NamesThatFit(BranchOf(path).SubKeyNames(path));
}

// The access is ignored: it is granted to everybody who can read the export.
RegistryData ReadRegistryData(const std::string& keyPath, const std::string& valueName,
                              size_t limit, RegistryAccess /*access*/) {
  return MachineRegistry().Read(keyPath, valueName, limit);
}

std::vector<std::string> EnumRegistryValueNames(const std::string& keyPath) {
  return MachineRegistry().ValueNames(keyPath);
}

std::vector<std::string> EnumRegistrySubKeys(const std::string& keyPath) {
  return MachineRegistry().SubKeyNames(keyPath);
}
