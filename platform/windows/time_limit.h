#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <optional>

// A time for calls that may never return, such as those that another process answers.
class TimeLimit {
 public:
  // For all calls together.
  explicit TimeLimit(std::chrono::milliseconds limit) : Left(limit) {}

  // Runs the work on a thread (CreateThread) and returns its result. Returns nothing if the time is
  // over first: the thread then runs on until the process ends, so the work must own what it uses.
  // Returns nothing, and does not run the work, if no time is left or no thread can be created.
  template <typename Work>
  auto Call(Work work) -> std::optional<decltype(work())> {
    auto result = std::make_shared<std::optional<decltype(work())>>();
    return Wait([work, result] { *result = work(); }) ? std::move(*result) : std::nullopt;
  }

 private:
  // False if the work did not end in time.
  bool Wait(std::function<void()> work);

  std::chrono::milliseconds Left;
};
