#pragma once

#include <cstddef>
#include <memory>
#include <optional>

// The terminal that a standard stream writes to.

enum class OutputStream { kOutput, kError };

// Its width in columns, 80 if it has none; nothing if the stream does not lead to a terminal.
// Windows: GetConsoleScreenBufferInfo. POSIX: isatty, ioctl TIOCGWINSZ.
std::optional<size_t> TerminalWidth(OutputStream stream);

// For as long as the object lives, a terminal of the two streams takes UTF-8 and the escape
// sequences of colours. Other programs of the same terminal are affected too.
// Windows: SetConsoleOutputCP, SetConsoleMode. POSIX: nothing to be done.
class Utf8Terminal {
 public:
  Utf8Terminal();
  ~Utf8Terminal();
  Utf8Terminal(const Utf8Terminal&) = delete;
  Utf8Terminal& operator=(const Utf8Terminal&) = delete;

  // False if the terminal of the output shows escape sequences as text (Windows before 10; POSIX:
  // the terminal "dumb"), or if there is none.
  bool HasColours() const;

 private:
  struct State;
  std::unique_ptr<State> Shared;
};
