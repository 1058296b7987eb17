#include "app/usage.h"

#include <iomanip>
#include <iostream>
#include <string>

#include "app/install_event.h"
#include "app/options.h"

void PrintUsage() {
  std::cout << "ORXInstallEventLog.exe -start|-end|-loglessage [EventID] " << std::endl;
  std::cout << "   {-CopyName [ORXCopyName]}" << std::endl;
  std::cout << "   {-l [FullQualifiedLogFileName]}" << std::endl;
  std::cout << "   {-t [FullQualifiedTraceFileName]}" << std::endl;
  std::cout << "   {-InstallType [InstallType]}" << std::endl;
  std::cout << "   {-product [ORXProductName]}" << std::endl;
  std::cout << "   {-ServiceLevel [ORXServiceLevel]}" << std::endl;
  std::cout << "   {-message [Message]} {-copyname [CopyName]} " << std::endl;
  std::cout << "   {-result [InstallationResult]}" << std::endl;
}

static void PrintHelpLine(std::string_view word, std::string_view value, std::string_view help) {
  const std::string call = std::string(word) + ' ' + std::string(value);
  std::cout << "  " << std::left << std::setw(24) << call << help << '\n';
}

void PrintHelp() {
  PrintUsage();
  std::cout << "\nOperations:\n";
  for (const Option& option : Options()) {
    if (option.Field == &CInstallEvent::EventID) {
      PrintHelpLine(option.Word, option.Value, option.Help);
    }
  }
  PrintHelpLine("-report", "ARCHIVE", "packs the history into a zip archive; no other argument");
  PrintHelpLine("-help", "", "this text; no other argument");
  PrintHelpLine("--version", "", "name and version; no other argument");
  std::cout
      << "\nOptions, each with one value, and the operations that use them. Case does not count;\n"
         "of a repeated option the last value counts; unknown words are skipped:\n";
  for (const Option& option : Options()) {
    if (option.Field != &CInstallEvent::EventID) {
      PrintHelpLine(option.Word, option.Value, option.Help);
    }
  }
}
