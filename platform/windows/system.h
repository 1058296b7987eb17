#pragma once

// The system's header without the parts that are not used here, and the owner of what CloseHandle
// closes: files, processes, threads, mutexes. An empty owner holds null.

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

// For the calls that return INVALID_HANDLE_VALUE when they fail.
inline UniqueHandle OwnIfValid(HANDLE handle) {
  return UniqueHandle(handle == INVALID_HANDLE_VALUE ? nullptr : handle);
}
