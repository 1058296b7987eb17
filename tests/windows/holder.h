#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <future>
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
  Holder(const std::function<UniqueHandle()>& acquire, std::chrono::steady_clock::duration time)
      : Thread([this, acquire, time] {
          const UniqueHandle held = acquire();
          Acquired.set_value(held != nullptr);
          Ended.get_future().wait_for(time);
        }) {
    EXPECT_TRUE(Acquired.get_future().get());
  }
  ~Holder() {
    Ended.set_value();
    Thread.join();
  }
  Holder(const Holder&) = delete;
  Holder& operator=(const Holder&) = delete;

 private:
  std::promise<bool> Acquired;
  std::promise<void> Ended;
  std::thread Thread;
};
