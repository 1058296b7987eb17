#include <algorithm>
#include <iostream>
#include <string_view>

#include "app/install_history.h"
#include "app/usage.h"
#include "platform/ascii_case.h"
#include "platform/process_setup.h"

static bool IsHelp(std::string_view argument) {
  constexpr std::string_view words[] = {"-help", "-h", "-?", "--help", "/?"};
  return std::any_of(std::begin(words), std::end(words), [argument](std::string_view word) {
    return EqualsIgnoringCase(word, argument);
  });
}

// Exit codes: 0 to 2 from CInstallHistory::Run, 3 if the archive is not complete.
int main(int argc, char** argv) {
  PrepareProcess();
  if (argc == 2 && IsHelp(argv[1])) {
    PrintHelp();
    return 0;
  }
  if (argc == 2 && EqualsIgnoringCase("--version", argv[1])) {
    std::cout << "ORXInstallEventLog " ORX_VERSION << std::endl;
    return 0;
  }
  const bool isReport = argc >= 2 && EqualsIgnoringCase("-report", argv[1]);
  if (isReport && argc == 2) {
    PrintUsage();
    return 2;
  }
  CInstallHistory history;
  if (isReport && argc == 3) {
    history.Report(argv[2]);
    return history.IsArchiveComplete ? 0 : 3;
  }
  return history.Run(argc, argv);
}
