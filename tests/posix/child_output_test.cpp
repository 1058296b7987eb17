#include "platform/posix/child_output.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include "platform/posix/text_file.h"

namespace {

using Work = std::function<void(const Descriptor&)>;

std::string Output(const Work& work, std::chrono::milliseconds limit = std::chrono::seconds(20)) {
  std::string text = ChildOutput(work, limit);
  EXPECT_EQ(::waitpid(-1, /*wstatus=*/nullptr, WNOHANG), -1) << "a zombie";
  return text;
}

TEST(ChildOutput, IsAllThatWasWritten) {
  const std::string large(1 << 20, 'x');
  EXPECT_EQ(Output([&](const Descriptor& output) { WriteAll(output, large); }), large);
  EXPECT_EQ(Output([](const Descriptor& output) {
              WriteAll(output, "before");
              ::abort();
            }),
            "before");
}

TEST(ChildOutput, EndsAtTheLimit) {
  const Work never = [](const Descriptor& output) {
    WriteAll(output, "some");
    ::signal(SIGTERM, SIG_IGN);
    for (;;) {
      ::pause();
    }
  };
  const Work slow = [](const Descriptor& output) {
    while (WriteAll(output, "")) {
      WriteAll(output, ".");
      ::usleep(1000);
    }
  };
  for (const Work& work : {never, slow}) {
    constexpr auto limit = std::chrono::milliseconds(100);
    const auto begin = std::chrono::steady_clock::now();
    EXPECT_NE(Output(work, limit), "");
    const auto taken = std::chrono::steady_clock::now() - begin;
    EXPECT_GE(taken, limit);
    EXPECT_LT(taken, 10 * limit);
  }
}

// A child that cannot be killed must keep no lock and no pipe of the caller open.
TEST(ChildOutput, ComesFromAChildWithoutOtherDescriptors) {
  const int other = ::dup(STDIN_FILENO);
  const std::string text = Output([](const Descriptor& output) {
    for (int number = 0; number < 100; ++number) {
      const bool isOpen = ::fcntl(number, F_GETFD) >= 0;
      char target[32] = "";
      const std::string link = "/proc/self/fd/" + std::to_string(number);
      if (isOpen && number != output.Get()) {
        ::readlink(link.c_str(), target, sizeof target - 1) > 0 && WriteAll(output, target);
      }
    }
  });
  ::close(other);
  EXPECT_EQ(text, "/dev/null/dev/null/dev/null");
}

}  // namespace
