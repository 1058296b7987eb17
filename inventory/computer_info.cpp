#include "inventory/computer_info.h"

#include <string>

#include "eventlog/logger.h"

int32_t CComputerInfo::Collect() {
  ComputerName = ShortComputerName().value_or("");
  CollectOSInfo();
  CollectCPUInfo();
  return 0;
}

int32_t CComputerInfo::Print() {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(45, '=');
  log << std::endl;
  log << "System Information: " << std::endl;
  log << rule << std::endl;
  log << "Computer Name       :" << ComputerName << std::endl;
  log << "OS                  :" << OSName << std::endl;
  log << "Type                :" << Type << std::endl;
  log << "Service Pack        :" << ServicePack << std::endl;
  log << "Number of processors:" << NumberOfProcessors << std::endl;
  log << "CPU                 :" << CPU << std::endl;
  log << rule << std::endl;
  log << std::endl;
  return 0;
}
