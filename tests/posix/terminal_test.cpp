#include "platform/terminal.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/ioctl.h>

#include <cstdlib>
#include <string>

#include "platform/posix/child_output.h"
#include "platform/posix/text_file.h"

namespace {

// The width that a process finds whose standard output is a terminal of so many columns.
std::string WidthOf(unsigned short columns) {
  return ChildOutput(
      [columns](const Descriptor& output) {
        const int terminal = ::posix_openpt(O_RDWR | O_NOCTTY);
        ::grantpt(terminal);
        ::unlockpt(terminal);
        const winsize size = {24, columns, 0, 0};
        ::ioctl(terminal, TIOCSWINSZ, &size);
        ::dup2(::open(::ptsname(terminal), O_RDWR | O_NOCTTY), STDOUT_FILENO);
        WriteAll(output, std::to_string(TerminalWidth(OutputStream::kOutput).value_or(0)) + ' ' +
                             std::to_string(TerminalWidth(OutputStream::kError).has_value()));
      },
      std::chrono::seconds(20));
}

TEST(Terminal, HasAWidth) {
  EXPECT_EQ(WidthOf(132), "132 0");
  EXPECT_EQ(WidthOf(0), "80 0");  // one that does not say
}

}  // namespace
