#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <semaphore>
#include <string>
#include <thread>

#include "platform/windows/system.h"

inline UniqueHandle OpenExisting(const std::string& path, DWORD access, DWORD share) {
  return OwnIfValid(::CreateFileA(path.c_str(), access, share, /*lpSecurityAttributes=*/nullptr,
                                  OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, /*hTemplateFile=*/nullptr));
}

// Another program: what it acquires it keeps until the object ends, or for the time given.
class Holder {
 public:
  Holder(std::function<UniqueHandle()> acquire, std::chrono::steady_clock::duration time)
      : Thread([this, acquire = std::move(acquire), time] {
          const UniqueHandle held = acquire();
          IsHeld = held != nullptr;
          Acquired.release();
          Ended.try_acquire_for(time);
        }) {
    Acquired.acquire();
    EXPECT_TRUE(IsHeld);
  }
  ~Holder() {
    Ended.release();
    Thread.join();
  }
  Holder(const Holder&) = delete;
  Holder& operator=(const Holder&) = delete;

 private:
  bool IsHeld = false;
  std::binary_semaphore Acquired{0};
  std::binary_semaphore Ended{0};
  std::thread Thread;
};
