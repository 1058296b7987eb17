#pragma once

#include <unistd.h>

#include <cerrno>

// A file descriptor that is closed with its owner; -1 is none.
class Descriptor {
 public:
  explicit Descriptor(int number = -1) : Number(number) {}
  Descriptor(Descriptor&& other) noexcept : Number(other.Release()) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    Reset(other.Release());
    return *this;
  }
  ~Descriptor() { Reset(-1); }

  int Get() const { return Number; }
  bool IsOpen() const { return Number >= 0; }

  void Reset(int number) {
    if (IsOpen()) {
      ::close(Number);
    }
    Number = number;
  }

  int Release() {
    const int number = Number;
    Number = -1;
    return number;
  }

 private:
  int Number;
};

// Repeats a system call as long as a signal interrupts it.
template <typename Call>
auto RetryOnInterrupt(Call call) {
  auto result = call();
  while (result == -1 && errno == EINTR) {
    result = call();
  }
  return result;
}
