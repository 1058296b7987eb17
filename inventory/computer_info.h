#pragma once

#include <cstdint>
#include <string>

#include "inventory/info.h"
#include "platform/computer.h"

// The machine's name, system and processor. A call that fails leaves its fields as they were, and
// the report shows them empty.
class CComputerInfo : public Info {
 public:
  int32_t Collect() override;
  int32_t Print() override;

  // The two halves of Collect. Both return 0 always.
  int32_t CollectOSInfo();
  int32_t CollectCPUInfo();

  bool IsDomainController = false;  // true only when the extended version data says so
  std::string ComputerName;
  std::string OSName;  // with its edition
  std::string ServicePack;
  std::string Type;  // "Workstation", "Server", "Domain Controller" or empty
  uint32_t MajorVersion = 0;
  uint32_t MinorVersion = 0;
  uint32_t BuildNumber = 0;
  uint16_t ServicePackMajor = 0;
  uint16_t ServicePackMinor = 0;
  uint8_t ProductType = 0;
  uint16_t ProcessorArchitecture = 0;
  uint32_t NumberOfProcessors = 0;
  std::string CPU;

 private:
  void NameOS(const SystemVersion& version, bool isExtended);
  void AddEdition(const SystemVersion& version);
  void AddWorkstationEdition(const SystemVersion& version);
  void AddServerEdition(const SystemVersion& version);
  void NameOSByRegistry();
};
