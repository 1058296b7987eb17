#include "app/usage.h"

#include <iostream>

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
