#include "reader/progress.h"

#include <iostream>

#include "platform/terminal.h"

Progress::Progress(std::string unit)
    : Unit(std::move(unit)),
      HasTerminal(TerminalWidth(OutputStream::kError).has_value()),
      Next(Clock::now() + std::chrono::milliseconds(700)) {}

Progress::~Progress() {
  if (IsShown) {
    std::cerr << '\r' << std::string(Unit.size() + 30, ' ') << '\r' << std::flush;
  }
}

void Progress::CountOne() {
  ++Count;
  if (!HasTerminal || Clock::now() < Next) {
    return;
  }
  std::cerr << '\r' << Count << ' ' << Unit << " read ..." << std::flush;
  IsShown = true;
  Next = Clock::now() + std::chrono::milliseconds(100);
}
