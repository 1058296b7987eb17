#include "platform/process_setup.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <csignal>

namespace {

int NextDescriptor() {
  const int next = ::open("/", O_RDONLY);
  ::close(next);
  return next;
}

TEST(ProcessSetup, OpensClosedDescriptorsAndIgnoresSignals) {
  const auto run = [] {
    const int next = NextDescriptor();
    ::close(STDIN_FILENO);
    ::close(STDOUT_FILENO);
    PrepareProcess();
    std::raise(SIGPIPE);
    std::raise(SIGXFSZ);
    const bool areOpen = (::fcntl(STDIN_FILENO, F_GETFL) & O_ACCMODE) == O_RDWR &&
                         ::write(STDOUT_FILENO, "x", /*count=*/1) == 1;
    ::_exit(areOpen && NextDescriptor() == next ? 7 : 1);
  };
  EXPECT_EXIT(run(), testing::ExitedWithCode(7), "");
}

}  // namespace
