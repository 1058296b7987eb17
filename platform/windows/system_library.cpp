#include "platform/windows/system_library.h"

#include "platform/path.h"

SystemLibrary::SystemLibrary(const char* name) {
  char folder[MAX_PATH] = {};
  const UINT length = ::GetSystemDirectoryA(folder, sizeof folder);
  if (length > 0 && length < sizeof folder) {
    // With the altered search path, what the library needs is searched for beside it first.
    Module.reset(::LoadLibraryExA(JoinPath(folder, name).c_str(), /*hFile=*/nullptr,
                                  LOAD_WITH_ALTERED_SEARCH_PATH));
  }
}
