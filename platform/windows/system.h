#pragma once

// The system's header without the parts that are not used here, and an owning type for each kind of
// handle. An empty owner holds null.

#define WIN32_LEAN_AND_MEAN
#ifndef NOMINMAX
#define NOMINMAX
#endif
#include <windows.h>

#include <cstdint>
#include <memory>

struct HandleCloser {
  void operator()(HANDLE handle) const { ::CloseHandle(handle); }
};
using UniqueHandle = std::unique_ptr<void, HandleCloser>;

// For the calls that return INVALID_HANDLE_VALUE when they fail.
inline UniqueHandle OwnIfValid(HANDLE handle) {
  return UniqueHandle(handle == INVALID_HANDLE_VALUE ? nullptr : handle);
}

// A handle as the platform-neutral headers keep it.
inline HANDLE AsHandle(intptr_t number) { return reinterpret_cast<HANDLE>(number); }

struct SearchCloser {
  void operator()(HANDLE search) const { ::FindClose(search); }
};
using UniqueSearch = std::unique_ptr<void, SearchCloser>;
