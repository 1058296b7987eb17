#include "platform/profile_file.h"

#include <string_view>

#include "platform/posix/profile_store.h"
#include "platform/profile_text.h"

std::string ReadProfileValue(const std::string& path, const std::string& section,
                             const std::string& key, const std::string& fallback, uint32_t size) {
  const ProfileText* text = ProfileStore::GetInstance().Load(path);
  const auto value = text == nullptr ? std::nullopt : text->Find(section, key);
  return std::string(value.value_or(fallback)).substr(0, size - 1);
}

bool WriteProfileValue(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value) {
  ProfileStore& store = ProfileStore::GetInstance();
  store.Lock(path);
  ProfileText* text = store.Load(path);
  if (text != nullptr) {
    text->Set(section, key, value);
    store.MarkChanged();
  }
  return store.Unlock() && text != nullptr;
}

int32_t ReadProfileInt(const std::string& path, const std::string& section, const std::string& key,
                       int32_t fallback) {
  const ProfileText* text = ProfileStore::GetInstance().Load(path);
  const auto value = text == nullptr ? std::nullopt : text->Find(section, key);
  if (!value) {
    return fallback;
  }
  std::string_view digits = *value;
  const bool isNegative = digits.starts_with('-');
  if (isNegative) {
    digits.remove_prefix(1);
  }
  uint32_t number = 0;  // a number of more than 32 bits keeps its lowest ones
  for (size_t i = 0; i < digits.size() && digits[i] >= '0' && digits[i] <= '9'; ++i) {
    number = number * 10 + static_cast<uint32_t>(digits[i] - '0');
  }
  return static_cast<int32_t>(isNegative ? 0 - number : number);
}

std::string ReadProfileSectionNames(const std::string& path, uint32_t size) {
  std::string names;
  if (const ProfileText* text = ProfileStore::GetInstance().Load(path)) {
    for (const std::string_view name : text->SectionNames()) {
      names.append(name).push_back('\0');
    }
  }
  if (names.size() + 1 <= size && !names.empty()) {
    return names + '\0';
  }
  return names.substr(0, size - 2) + std::string(2, '\0');
}

ProfileGuard::ProfileGuard(const std::string& path) { ProfileStore::GetInstance().Lock(path); }

ProfileGuard::~ProfileGuard() { ProfileStore::GetInstance().Unlock(); }
