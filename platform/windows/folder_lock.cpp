#include "platform/windows/folder_lock.h"

#include <algorithm>
#include <cstdint>
#include <cstdio>

#include "platform/path.h"
// It needs windows.h.
#include <sddl.h>

// A name of an object may have no backslash and at most 260 characters, so it has a hash (FNV-1a)
// of the folder's path.
static std::string MutexName(const std::string& folder) {
  std::string path = AbsolutePath(folder + '.').value_or(folder);
  // All spellings of a path lead to one lock. CharLowerBuffA would need user32.dll.
  const int size = static_cast<int>(path.size());
  std::string lower(path.size(), '\0');
  if (::LCMapStringA(LOCALE_SYSTEM_DEFAULT, LCMAP_LOWERCASE, path.data(), size, lower.data(),
                     size) == size) {
    path = lower;
  }
  uint64_t hash = 0xCBF29CE484222325;
  for (const char c : path) {
    hash = (hash ^ static_cast<unsigned char>(c)) * 0x100000001B3;
  }
  char name[64] = {};
  std::snprintf(name, sizeof name, "Global\\FolderLock-%016llx",
                static_cast<unsigned long long>(hash));
  return name;
}

UniqueHandle OpenFolderMutex(const std::string& folder) {
  constexpr DWORD access = SYNCHRONIZE | MUTEX_MODIFY_STATE;  // 0x100001
  SECURITY_ATTRIBUTES security = {sizeof security, /*lpSecurityDescriptor=*/nullptr,
                                  /*bInheritHandle=*/FALSE};
  // Every user (WD) may use it, whichever user created it. If this fails, it has default security.
  ::ConvertStringSecurityDescriptorToSecurityDescriptorA("D:(A;;0x100001;;;WD)", SDDL_REVISION_1,
                                                         &security.lpSecurityDescriptor,
                                                         /*SecurityDescriptorSize=*/nullptr);
  UniqueHandle mutex(::CreateMutexExA(
      security.lpSecurityDescriptor == nullptr ? nullptr : &security, MutexName(folder).c_str(),
      /*dwFlags=*/0, access));
  ::LocalFree(security.lpSecurityDescriptor);
  return mutex;
}

FolderLock::FolderLock(const std::string& folder, std::chrono::nanoseconds& timeLeft)
    : Mutex(OpenFolderMutex(folder)) {
  if (!Mutex) {
    return;
  }
  const auto begin = std::chrono::steady_clock::now();
  const auto patience = std::chrono::duration_cast<std::chrono::milliseconds>(timeLeft).count();
  const DWORD result =
      ::WaitForSingleObject(Mutex.get(), static_cast<DWORD>(std::max<int64_t>(patience, 0)));
  timeLeft -= std::chrono::steady_clock::now() - begin;
  // An owner that ended without releasing it left no file half written.
  IsOwner = result == WAIT_OBJECT_0 || result == WAIT_ABANDONED;
}

FolderLock::~FolderLock() {
  if (IsOwner) {
    ::ReleaseMutex(Mutex.get());
  }
}
