#include "platform/windows/time_limit.h"

#include <gtest/gtest.h>

#include "platform/windows/system.h"

namespace {

using namespace std::chrono_literals;

TEST(TimeLimit, IsForAllCallsTogether) {
  TimeLimit limit(200ms);
  EXPECT_EQ(limit.Call([] { return std::string("in time"); }), "in time");
  const auto begin = std::chrono::steady_clock::now();
  const auto late = [] {
    ::Sleep(/*dwMilliseconds=*/20'000);
    return 1;
  };
  EXPECT_EQ(limit.Call(late), std::nullopt);
  EXPECT_EQ(limit.Call([] { return 2; }), std::nullopt);
  EXPECT_LT(std::chrono::steady_clock::now() - begin, 10s);
}

}  // namespace
