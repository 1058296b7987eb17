#include "platform/profile_file.h"

#include <algorithm>

#include "platform/ascii_case.h"
#include "platform/posix/profile_store.h"
#include "platform/profile_text.h"

static std::optional<std::string_view> Find(const std::string& path, const std::string& section,
                                            const std::string& key) {
  const ProfileText* text = ProfileStore::GetInstance().Load(path);
  return text == nullptr ? std::nullopt : text->Find(section, key);
}

std::string ReadProfileValue(const std::string& path, const std::string& section,
                             const std::string& key, const std::string& fallback, uint32_t size) {
  const std::string_view value = Find(path, section, key).value_or(fallback);
  return std::string(value.substr(0, std::max(size, 1U) - 1));
}

bool WriteProfileValue(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value) {
  ProfileStore& store = ProfileStore::GetInstance();
  store.Enter(path);
  const bool isSet = store.Set(path, section, key, value);
  return store.Leave() && isSet;
}

// 16 after "0x", 8 after "0o", 2 after "0b", which is then removed; else 10.
static uint32_t TakeBase(std::string_view& digits) {
  constexpr std::pair<std::string_view, uint32_t> prefixes[] = {{"0x", 16}, {"0o", 8}, {"0b", 2}};
  for (const auto& [prefix, base] : prefixes) {
    if (digits.starts_with(prefix)) {
      digits.remove_prefix(prefix.size());
      return base;
    }
  }
  return 10;
}

// The value of a digit, or a number that is above every base.
static uint32_t DigitOf(char c) {
  const char lower = ToLowerAscii(c);
  return c >= '0' && c <= '9'           ? static_cast<uint32_t>(c - '0')
         : lower >= 'a' && lower <= 'f' ? static_cast<uint32_t>(lower - 'a' + 10)
                                        : UINT32_MAX;
}

int32_t ReadProfileInt(const std::string& path, const std::string& section, const std::string& key,
                       int32_t fallback) {
  std::string_view text = Find(path, section, key).value_or("");
  if (text.empty()) {
    return fallback;
  }
  while (!text.empty() && static_cast<unsigned char>(text.front()) <= ' ') {
    text.remove_prefix(1);
  }
  const bool isNegative = text.starts_with('-');
  if (isNegative || text.starts_with('+')) {
    text.remove_prefix(1);
  }
  const uint32_t base = TakeBase(text);
  uint32_t number = 0;  // of more than 32 bits the lowest ones remain
  for (size_t i = 0; i < text.size() && DigitOf(text[i]) < base; ++i) {
    number = number * base + DigitOf(text[i]);
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
  if (names.size() < size && !names.empty()) {
    return names + '\0';
  }
  return names.substr(0, std::max(size, 2U) - 2) + std::string(2, '\0');
}

void LimitProfileLockTime(std::chrono::milliseconds time) {
  ProfileStore::GetInstance().LockTime = time;
}

ProfileGuard::ProfileGuard(const std::string& path) { ProfileStore::GetInstance().Enter(path); }

ProfileGuard::~ProfileGuard() { ProfileStore::GetInstance().Leave(); }
