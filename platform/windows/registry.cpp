#include "platform/registry.h"

#include "platform/windows/system.h"

namespace {

struct KeyCloser {
  using pointer = HKEY;
  void operator()(HKEY key) const { ::RegCloseKey(key); }
};
using UniqueKey = std::unique_ptr<HKEY, KeyCloser>;

UniqueKey OpenKey(const std::string& path, RegistryAccess access) {
  HKEY key = nullptr;
  const LSTATUS status = ::RegOpenKeyExA(HKEY_LOCAL_MACHINE, path.c_str(), /*ulOptions=*/0,
                                         static_cast<REGSAM>(access), &key);
  return UniqueKey(status == ERROR_SUCCESS ? key : nullptr);
}

// The names that a call returns for the indices from 0 on, until it fails.
template <typename Call>
std::vector<std::string> EnumNames(const std::string& path, Call call) {
  std::vector<std::string> names;
  const UniqueKey key = OpenKey(path, RegistryAccess::kReadAndSet);
  char name[256] = {};
  DWORD size = sizeof name;
  for (DWORD i = 0; key && call(key.get(), i, name, &size) == ERROR_SUCCESS; ++i) {
    names.emplace_back(name, size);
    size = sizeof name;
  }
  return names;
}

}  // namespace

RegistryData ReadRegistryData(const std::string& keyPath, const std::string& valueName,
                              size_t limit, RegistryAccess access) {
  RegistryData data;
  const UniqueKey key = OpenKey(keyPath, access);
  DWORD type = 0;
  if (!key || ::RegQueryValueExA(key.get(), valueName.c_str(), /*lpReserved=*/nullptr, &type,
                                 /*lpData=*/nullptr, /*lpcbData=*/nullptr) != ERROR_SUCCESS) {
    return data;
  }
  data.Type = type;
  data.Bytes.resize(limit);
  auto size = static_cast<DWORD>(limit);
  const LSTATUS status =
      ::RegQueryValueExA(key.get(), valueName.c_str(), /*lpReserved=*/nullptr, /*lpType=*/nullptr,
                         reinterpret_cast<BYTE*>(data.Bytes.data()), &size);
  data.Bytes.resize(status == ERROR_SUCCESS ? size : 0);
  return data;
}

std::vector<std::string> EnumRegistryValueNames(const std::string& keyPath) {
  return EnumNames(keyPath, [](HKEY key, DWORD index, char* name, DWORD* size) {
    return ::RegEnumValueA(key, index, name, size, /*lpReserved=*/nullptr, /*lpType=*/nullptr,
                           /*lpData=*/nullptr, /*lpcbData=*/nullptr);
  });
}

std::vector<std::string> EnumRegistrySubKeys(const std::string& keyPath) {
  return EnumNames(keyPath, [](HKEY key, DWORD index, char* name, DWORD* size) {
    return ::RegEnumKeyExA(key, index, name, size, /*lpReserved=*/nullptr, /*lpClass=*/nullptr,
                           /*lpcchClass=*/nullptr, /*lpftLastWriteTime=*/nullptr);
  });
}
