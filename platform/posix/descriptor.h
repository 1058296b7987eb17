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

inline bool HasFailed(const void* result) { return result == nullptr; }
inline bool HasFailed(ssize_t result) { return result == -1; }

// Repeats a system call as long as a signal interrupts it: on a network or user-space file system
// that can be any call with a path or descriptor. Sets errno to zero before each call: a null
// pointer can also mean the end of a list or an unknown name, and then leaves errno as it was.
template <typename Call>
auto RetryOnInterrupt(Call call) {
  for (;;) {
    errno = 0;
    const auto result = call();
    if (!HasFailed(result) || errno != EINTR) {
      return result;
    }
  }
}
