#include "platform/windows/profile_store.h"

#include "platform/files.h"
#include "platform/path.h"
#include "platform/windows/file_entry.h"
// It needs what the system's header defines.
#include <sddl.h>

// A mutex of the whole machine, as the history is, whichever session or user the runs belong to:
// everyone may wait for it and free it, and only that is asked for.
static HANDLE OpenSharedMutex() {
  constexpr DWORD access = SYNCHRONIZE | MUTEX_MODIFY_STATE;
  constexpr const char* everyoneMayUse = "D:(A;;0x100001;;;WD)";
  SECURITY_ATTRIBUTES security = {sizeof security, /*lpSecurityDescriptor=*/nullptr,
                                  /*bInheritHandle=*/FALSE};
  if (::ConvertStringSecurityDescriptorToSecurityDescriptorA(
          everyoneMayUse, SDDL_REVISION_1, &security.lpSecurityDescriptor,
          /*SecurityDescriptorSize=*/nullptr) == FALSE) {
    return nullptr;
  }
  const HANDLE mutex = ::CreateMutexExA(&security, "Global\\ORXInstallEventLog.History",
                                        /*dwFlags=*/0, access);
  ::LocalFree(security.lpSecurityDescriptor);
  return mutex;
}

ProfileStore::ProfileStore() : Mutex(OpenSharedMutex()) {}

ProfileStore& ProfileStore::GetInstance() {
  static ProfileStore instance;
  return instance;
}

void ProfileStore::Lock(const std::string& path) {
  if (Depth++ > 0) {
    return;
  }
  // An owner that died left the file whole, so that its guard is as good as a free one.
  ::WaitForSingleObject(Mutex.get(), INFINITE);
  Path = path;
  Growing = FolderPart(path) + ".History.tmp";
}

const std::string& ProfileStore::ForReading(const std::string& path) const {
  return Changes == State::kChanged && path == Path ? Growing : path;
}

std::string ProfileStore::ForWriting(const std::string& path) {
  if (path != Path) {
    return "";
  }
  if (Changes == State::kUnchanged) {
    Changes = MakeCopy() ? State::kChanged : State::kFailed;
  }
  return Changes == State::kChanged ? Growing : "";
}

void ProfileStore::MarkFailed() { Changes = State::kFailed; }

// True with no copy too if there is nothing to copy yet.
bool ProfileStore::MakeCopy() {
  if (KindOf(Growing) == FileKind::kFolder) {  // an event can be called anything
    Growing = FolderPart(Path) + ".History-" + std::to_string(::GetCurrentProcessId()) + ".tmp";
  }
  RemoveFile(Growing);
  return ::CopyFileA(Path.c_str(), Growing.c_str(), /*bFailIfExists=*/1) != FALSE ||
         ::GetLastError() == ERROR_FILE_NOT_FOUND;
}

static bool FlushToDisk(const std::string& path) {
  const UniqueHandle file = OwnIfValid(
      ::CreateFileA(path.c_str(), GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE,
                    /*lpSecurityAttributes=*/nullptr, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL,
                    /*hTemplateFile=*/nullptr));
  return file && ::FlushFileBuffers(file.get()) != FALSE;
}

// A program that looks at every new file, or shows this one, can keep it from being replaced for a
// moment; all keys of an event are worth some patience.
static bool Replace(const std::string& source, const std::string& target) {
  constexpr int attempts = 25;
  constexpr DWORD pause = 20;  // milliseconds
  for (int i = 0; i < attempts; ++i) {
    if (::MoveFileExA(source.c_str(), target.c_str(),
                      MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH) != FALSE) {
      return true;
    }
    const DWORD error = ::GetLastError();
    if (error != ERROR_SHARING_VIOLATION && error != ERROR_ACCESS_DENIED) {
      return false;
    }
    ::Sleep(pause);
  }
  return false;
}

bool ProfileStore::Store() const { return FlushToDisk(Growing) && Replace(Growing, Path); }

bool ProfileStore::Unlock() {
  if (--Depth > 0) {
    return true;
  }
  const bool isStored = Changes == State::kUnchanged || (Changes == State::kChanged && Store());
  if (!isStored) {
    RemoveFile(Growing);
  }
  Changes = State::kUnchanged;
  ::ReleaseMutex(Mutex.get());
  return isStored;
}
