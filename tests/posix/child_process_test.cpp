// Child processes: their output, the descriptors that they have, and the terminal that they find.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <string>

#include "platform/posix/child_output.h"
#include "platform/posix/text_file.h"
#include "platform/terminal.h"

namespace {

using Work = std::function<void(const Descriptor&)>;

std::string Output(const Work& work, std::chrono::milliseconds limit = std::chrono::seconds(20)) {
  std::string text = ChildOutput(work, limit);
  EXPECT_EQ(::waitpid(-1, /*wstatus=*/nullptr, WNOHANG), -1) << "a zombie";
  return text;
}

TEST(ChildOutput, IsAllThatWasWritten) {
  const std::string large(1 << 20, 'x');
  EXPECT_EQ(Output([&large](const Descriptor& output) {
              WriteAll(output, large);
              ::abort();
            }),
            large);
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
    while (WriteAll(output, ".")) {
      ::usleep(1000);
    }
  };
  for (const Work& work : {never, slow}) {
    const auto begin = std::chrono::steady_clock::now();
    EXPECT_NE(Output(work, std::chrono::milliseconds(100)), "");
    const std::chrono::duration<double> seconds = std::chrono::steady_clock::now() - begin;
    EXPECT_TRUE(seconds.count() >= 0.1 && seconds.count() < 1) << seconds.count();
  }
}

// A child that cannot be killed must keep no lock and no pipe of the caller open.
TEST(ChildOutput, ComesFromAChildWithoutOtherDescriptors) {
  const int other = ::dup(STDIN_FILENO);
  const std::string text = Output([](const Descriptor& output) {
    for (int number = 0; number < 100; ++number) {
      char target[32] = "";
      const std::string link = "/proc/self/fd/" + std::to_string(number);
      if (::readlink(link.c_str(), target, sizeof target - 1) > 0 && number != output.Get()) {
        WriteAll(output, target);
      }
    }
  });
  ::close(other);
  EXPECT_EQ(text, "/dev/null/dev/null/dev/null");
}

// The width that a process finds whose standard output is a terminal of so many columns.
std::string WidthOf(unsigned short columns) {
  return Output([columns](const Descriptor& output) {
    const int terminal = ::posix_openpt(O_RDWR | O_NOCTTY);
    ::grantpt(terminal);
    ::unlockpt(terminal);
    const winsize size = {24, columns, 0, 0};
    ::ioctl(terminal, TIOCSWINSZ, &size);
    ::dup2(::open(::ptsname(terminal), O_RDWR | O_NOCTTY), STDOUT_FILENO);
    WriteAll(output, std::to_string(TerminalWidth(OutputStream::kOutput).value_or(0)) + ' ' +
                         std::to_string(TerminalWidth(OutputStream::kError).has_value()));
  });
}

TEST(Terminal, HasAWidth) {
  EXPECT_EQ(WidthOf(132), "132 0");
  EXPECT_EQ(WidthOf(0), "80 0");  // one that does not say
}

}  // namespace
