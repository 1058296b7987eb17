#include "platform/posix/descriptor.h"

#include <gtest/gtest.h>

namespace {

TEST(Descriptor, RepeatsACallThatSignalsInterrupt) {
  int calls = 0;
  const auto callWith = [&calls](int interruptions, ssize_t last) {
    calls = 0;
    return RetryOnInterrupt([&, interruptions, last] {
      const bool isInterrupted = ++calls <= interruptions;
      errno = isInterrupted ? EINTR : ENOENT;
      return isInterrupted ? ssize_t{-1} : last;
    });
  };
  EXPECT_TRUE(callWith(5, 7) == 7 && calls == 6);
  EXPECT_TRUE(callWith(0, -1) == -1 && calls == 1);
}

}  // namespace
