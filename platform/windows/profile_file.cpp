#include "platform/profile_file.h"

#include "platform/windows/profile_store.h"
#include "platform/windows/system.h"

using namespace std::string_literals;

std::string ReadProfileValue(const std::string& path, const std::string& section,
                             const std::string& key, const std::string& fallback, uint32_t size) {
  const ProfileGuard guard(path);
  std::string buffer(size, '\0');
  ::GetPrivateProfileStringA(section.c_str(), key.c_str(), fallback.c_str(), buffer.data(), size,
                             ProfileStore::GetInstance().ForReading(path).c_str());
  return buffer.c_str();
}

bool WriteProfileValue(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value) {
  ProfileStore& store = ProfileStore::GetInstance();
  store.Lock(path);
  const std::string file = store.ForWriting(path);
  const bool isWritten =
      !file.empty() && ::WritePrivateProfileStringA(section.c_str(), key.c_str(), value.c_str(),
                                                    file.c_str()) != FALSE;
  if (!isWritten) {
    store.MarkFailed();
  }
  return store.Unlock() && isWritten;
}

int32_t ReadProfileInt(const std::string& path, const std::string& section, const std::string& key,
                       int32_t fallback) {
  const ProfileGuard guard(path);
  return static_cast<int32_t>(
      ::GetPrivateProfileIntA(section.c_str(), key.c_str(), fallback,
                              ProfileStore::GetInstance().ForReading(path).c_str()));
}

std::string ReadProfileSectionNames(const std::string& path, uint32_t size) {
  const ProfileGuard guard(path);
  std::string buffer(size, '\0');
  ::GetPrivateProfileSectionNamesA(buffer.data(), size,
                                   ProfileStore::GetInstance().ForReading(path).c_str());
  return buffer.substr(0, buffer.find("\0\0"s) + 2);
}

ProfileGuard::ProfileGuard(const std::string& path) { ProfileStore::GetInstance().Lock(path); }

ProfileGuard::~ProfileGuard() { ProfileStore::GetInstance().Unlock(); }
