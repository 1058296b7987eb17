#include <iostream>

#include "app/install_history.h"

int CInstallHistory::Report(const std::string& archiveName) {
  std::cout << " Failed to create file '" << archiveName << "'" << std::endl;
  return 0;
}
