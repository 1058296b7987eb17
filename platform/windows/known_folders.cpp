#include "platform/known_folders.h"

#include "platform/windows/system_library.h"

std::string GetFolderPath(int32_t csidl) {
  using Function = HRESULT(WINAPI*)(HWND, int, HANDLE, DWORD, LPSTR);
  constexpr DWORD defaultPath = 1;                     // SHGFP_TYPE_DEFAULT
  static const SystemLibrary library("shfolder.dll");  // a run needs many paths
  const auto getFolderPath = library.Find<Function>("SHGetFolderPathA");
  if (getFolderPath == nullptr) {
    return "";
  }
  char path[MAX_PATH] = {};
  getFolderPath(/*hwnd=*/nullptr, csidl, /*hToken=*/nullptr, defaultPath, path);
  return path;
}
