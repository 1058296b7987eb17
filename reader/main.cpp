#include <cstdlib>
#include <iostream>

#include "platform/memory.h"
#include "platform/process_setup.h"
#include "platform/terminal.h"
#include "reader/commands.h"

static ViewOptions OptionsOf(const CommandLine& line, const Utf8Terminal& terminal) {
  const char* noColour = std::getenv("NO_COLOR");
  ViewOptions options;
  options.Width = TerminalWidth(OutputStream::kOutput);
  options.HasColours = terminal.HasColours() && (noColour == nullptr || *noColour == '\0');
  options.ShowsAll = line.ShowsAll;
  return options;
}

// Exit codes: 0 done; 1 for a check that found something and a search that found nothing; 2 for a
// failure, which one line on standard error explains.
int main(int argc, char** argv) {
  PrepareProcess();
  KeepFreedMemory();
  std::ios::sync_with_stdio(false);
  const Utf8Terminal terminal;
  int result = 0;
  const std::optional<CommandLine> line = ParseCommandLine(argc, argv, ORX_VERSION, result);
  if (line) {
    result = RunCommand(*line, OptionsOf(*line, terminal));
  }
  return std::cout.flush() ? result : 2;
}
