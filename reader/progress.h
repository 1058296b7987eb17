#pragma once

#include <chrono>
#include <cstddef>
#include <string>

// Shows on standard error how far a long work is, in one line that is removed with the object, if
// that is a terminal and the work takes more than a moment.
class Progress {
 public:
  // What is counted, as "reports".
  explicit Progress(std::string unit);
  ~Progress();
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;

  void CountOne();

 private:
  using Clock = std::chrono::steady_clock;

  std::string Unit;
  bool HasTerminal;
  bool IsShown = false;
  size_t Count = 0;
  Clock::time_point Next;
};
