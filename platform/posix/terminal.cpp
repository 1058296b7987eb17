#include "platform/terminal.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <cstdlib>
#include <string_view>

#include "platform/posix/descriptor.h"

std::optional<size_t> TerminalWidth(OutputStream stream) {
  const int file = stream == OutputStream::kOutput ? STDOUT_FILENO : STDERR_FILENO;
  if (::isatty(file) == 0) {
    return std::nullopt;
  }
  winsize size = {};
  const int result = RetryOnInterrupt([&] { return ::ioctl(file, TIOCGWINSZ, &size); });
  return result == 0 && size.ws_col > 0 ? size.ws_col : 80;
}

struct Utf8Terminal::State {
  bool HasColours = false;
};

Utf8Terminal::Utf8Terminal() : Shared(std::make_unique<State>()) {
  const char* kind = std::getenv("TERM");
  Shared->HasColours =
      ::isatty(STDOUT_FILENO) != 0 && kind != nullptr && kind != std::string_view("dumb");
}

Utf8Terminal::~Utf8Terminal() = default;

bool Utf8Terminal::HasColours() const { return Shared->HasColours; }
