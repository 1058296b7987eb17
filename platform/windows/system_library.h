#pragma once

#include <memory>

#include "platform/windows/system.h"

// A library that is loaded at run time, from the system folder only (LoadLibraryExA): the program's
// own folder, which Windows searches first, is often a temporary one that others can write to. If
// it cannot be loaded, no function is found.
class SystemLibrary {
 public:
  explicit SystemLibrary(const char* name);

  // The function of that name (GetProcAddress); null if there is none.
  template <typename Function>
  Function Find(const char* name) const {
    return Module == nullptr ? nullptr
                             : reinterpret_cast<Function>(
                                   reinterpret_cast<void*>(::GetProcAddress(Module.get(), name)));
  }

 private:
  struct Freer {
    using pointer = HMODULE;
    void operator()(HMODULE module) const { ::FreeLibrary(module); }
  };
  std::unique_ptr<HMODULE, Freer> Module;
};
