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

Utf8Terminal::Utf8Terminal() : EarlierCodePage(::GetConsoleOutputCP()) {
  // Without a console these calls fail and nothing changes.
  ::SetConsoleOutputCP(CP_UTF8);
  const HANDLE output = ::GetStdHandle(STD_OUTPUT_HANDLE);
  DWORD mode = 0;
  if (::GetConsoleMode(output, &mode) != FALSE) {
    EarlierMode = mode;
    ShowsColours = ::SetConsoleMode(output, mode | ENABLE_VIRTUAL_TERMINAL_PROCESSING) != FALSE;
  }
}

Utf8Terminal::~Utf8Terminal() {
  if (ShowsColours) {
    ::SetConsoleMode(::GetStdHandle(STD_OUTPUT_HANDLE), EarlierMode);
  }
  if (EarlierCodePage != 0) {
    ::SetConsoleOutputCP(EarlierCodePage);
  }
}
