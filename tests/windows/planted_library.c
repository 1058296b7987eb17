/* Copied beside the program under the name of a library of the system; ends a process that loads
   it. */
#include <windows.h>

BOOL WINAPI DllMain(HINSTANCE instance, DWORD reason, LPVOID reserved) {
  (void)instance;
  (void)reserved;
  if (reason == DLL_PROCESS_ATTACH) {
    TerminateProcess(GetCurrentProcess(), 77);
  }
  return TRUE;
}
