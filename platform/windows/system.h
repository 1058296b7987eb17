#pragma once

// The system's own header, without the parts that nobody here needs, and the handles that it hands
// out, each in a type that closes it with its owner. Empty owners hold null.

#define WIN32_LEAN_AND_MEAN
#ifndef NOMINMAX
#define NOMINMAX
#endif
#include <windows.h>

#include <memory>

struct HandleCloser {
  void operator()(HANDLE handle) const { ::CloseHandle(handle); }
};
using UniqueHandle = std::unique_ptr<void, HandleCloser>;

// What the calls give that say "none" with all bits set.
inline UniqueHandle OwnIfValid(HANDLE handle) {
  return UniqueHandle(handle == INVALID_HANDLE_VALUE ? nullptr : handle);
}

struct SearchCloser {
  void operator()(HANDLE search) const { ::FindClose(search); }
};
using UniqueSearch = std::unique_ptr<void, SearchCloser>;

// A library that is looked for at run time. Without it no function is found.
class Library {
 public:
  explicit Library(const char* name) : Module(::LoadLibraryA(name)) {}

  // Null if there is no function of that name.
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
