#include "platform/profile_file.h"

#include <algorithm>

#include "platform/windows/profile_store.h"
#include "platform/windows/system.h"

using namespace std::string_literals;

std::string ReadProfileValue(const std::string& path, const std::string& section,
                             const std::string& key, const std::string& fallback, uint32_t size) {
  const ProfileGuard guard(path);
  const uint32_t bufferSize = std::max(size, 1U);
  const auto file = ProfileStore::GetInstance().OpenForReading(path);
  if (file.Path.empty()) {
    return fallback.substr(0, bufferSize - 1);
  }
  std::string buffer(bufferSize, '\0');
  ::GetPrivateProfileStringA(section.c_str(), key.c_str(), fallback.c_str(), buffer.data(),
                             bufferSize, file.Path.c_str());
  return buffer.c_str();
}

bool WriteProfileValue(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value) {
  ProfileStore& store = ProfileStore::GetInstance();
  store.Enter(path);
  const bool isWritten = store.Write(path, section, key, value);
  return store.Leave() && isWritten;
}

int32_t ReadProfileInt(const std::string& path, const std::string& section, const std::string& key,
                       int32_t fallback) {
  const ProfileGuard guard(path);
  const auto file = ProfileStore::GetInstance().OpenForReading(path);
  return file.Path.empty() ? fallback
                           : static_cast<int32_t>(::GetPrivateProfileIntA(
                                 section.c_str(), key.c_str(), fallback, file.Path.c_str()));
}

std::string ReadProfileSectionNames(const std::string& path, uint32_t size) {
  const ProfileGuard guard(path);
  std::string buffer(std::max(size, 2U), '\0');
  const auto file = ProfileStore::GetInstance().OpenForReading(path);
  if (!file.Path.empty()) {
    ::GetPrivateProfileSectionNamesA(buffer.data(), static_cast<DWORD>(buffer.size()),
                                     file.Path.c_str());
  }
  return buffer.substr(0, buffer.find("\0\0"s) + 2);
}

void LimitProfileLockTime(std::chrono::milliseconds time) {
  ProfileStore::GetInstance().LockTime = time;
}

ProfileGuard::ProfileGuard(const std::string& path) { ProfileStore::GetInstance().Enter(path); }

ProfileGuard::~ProfileGuard() { ProfileStore::GetInstance().Leave(); }
