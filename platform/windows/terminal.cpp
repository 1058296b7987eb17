#include "platform/terminal.h"

#include "platform/windows/system.h"

#ifndef ENABLE_VIRTUAL_TERMINAL_PROCESSING
#define ENABLE_VIRTUAL_TERMINAL_PROCESSING 0x4
#endif

std::optional<size_t> TerminalWidth(OutputStream stream) {
  CONSOLE_SCREEN_BUFFER_INFO info = {};
  const DWORD number = stream == OutputStream::kOutput ? STD_OUTPUT_HANDLE : STD_ERROR_HANDLE;
  if (::GetConsoleScreenBufferInfo(::GetStdHandle(number), &info) == FALSE) {
    return std::nullopt;
  }
  const int width = info.srWindow.Right - info.srWindow.Left + 1;
  return width > 0 ? static_cast<size_t>(width) : 80;
}

// What the console had before; zero without a console.
struct Utf8Terminal::State {
  UINT CodePage = ::GetConsoleOutputCP();
  DWORD Mode = 0;
  bool HasColours = false;
};

Utf8Terminal::Utf8Terminal() : Shared(std::make_unique<State>()) {
  // Without a console these calls fail and nothing changes.
  ::SetConsoleOutputCP(CP_UTF8);
  const HANDLE output = ::GetStdHandle(STD_OUTPUT_HANDLE);
  if (::GetConsoleMode(output, &Shared->Mode) != FALSE) {
    Shared->HasColours =
        ::SetConsoleMode(output, Shared->Mode | ENABLE_VIRTUAL_TERMINAL_PROCESSING) != FALSE;
  }
}

Utf8Terminal::~Utf8Terminal() {
  if (Shared->HasColours) {
    ::SetConsoleMode(::GetStdHandle(STD_OUTPUT_HANDLE), Shared->Mode);
  }
  if (Shared->CodePage != 0) {
    ::SetConsoleOutputCP(Shared->CodePage);
  }
}

bool Utf8Terminal::HasColours() const { return Shared->HasColours; }
