#pragma once

#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <future>
#include <string>
#include <thread>

#include "platform/windows/file_handle.h"

// Another program: it keeps what it has acquired until the object ends or the time has passed.
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
  // It has a file open for reading.
  Holder(const std::string& path, DWORD share, std::chrono::steady_clock::duration time)
      : Holder([&] { return OpenExisting(path, GENERIC_READ, share); }, time) {}
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
