#include "platform/process_setup.h"

#include "platform/windows/system_library.h"

// For what the system loads later on its own account. Windows 8 and updated older ones know the
// call.
static void SearchLibrariesInSystemFolder() {
  const auto setDirectories =
      SystemLibrary("kernel32.dll").Find<BOOL(WINAPI*)(DWORD)>("SetDefaultDllDirectories");
  if (setDirectories != nullptr) {
    constexpr DWORD searchSystem32 = 0x800;
    setDirectories(searchSystem32);
  }
}

void PrepareProcess() {
  ::SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOOPENFILEERRORBOX);
  SearchLibrariesInSystemFolder();
}
