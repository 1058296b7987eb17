#include "inventory/computer_info.h"

static const char* NameByArchitecture(const SystemInfo& system) {
  switch (system.ProcessorArchitecture) {
    case 0:
      return system.ProcessorLevel == 4   ? "Intel 80486"
             : system.ProcessorLevel == 5 ? "Intel Pentium"
                                          : "INTEL ";
    case 1:
      return "MIPS ";
    case 2:
      return "ALPHA ";
    case 3:
      return "PPC";
    case 6:
      return "IA64";
    case 9:
      return "AMD64";
    case 10:
      return "IA32_ON_WIN64";
    default:
      return "Unknown Processor";
  }
}

int32_t CComputerInfo::CollectCPUInfo() {
  const SystemInfo system = QuerySystemInfo();
  ProcessorArchitecture = system.ProcessorArchitecture;
  NumberOfProcessors = system.NumberOfProcessors;
  CPU = NameByArchitecture(system);
  // The type has precedence over the architecture.
  switch (system.ProcessorType) {
    case 386:
      CPU = "Intel 386";
      break;
    case 486:
      CPU = "Intel 486";
      break;
    case 586:
      CPU = "Intel Pentium";
      break;
    default:
      break;
  }
  return 0;
}
