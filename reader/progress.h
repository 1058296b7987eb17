#pragma once

#include <chrono>
#include <cstddef>
#include <string>

// Shows the progress of a long operation on standard error, if that is a terminal and the operation
// takes more than 0.7 seconds: one line, which the destructor removes.
class Progress {
 public:
  // The unit is what is counted, such as "reports".
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
