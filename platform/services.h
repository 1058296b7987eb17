#pragma once

#include <cstdint>
#include <string>
#include <vector>

// The services of the machine.

struct ServiceEntry {
  std::string ServiceName;
  std::string DisplayName;
  uint32_t CurrentState = 0;  // 1 stopped, 2 starting, 3 stopping, 4 running, 5 to 7 pausing
};

struct ServiceListing {
  uint32_t Error = 0;  // the system's code for the step that failed; then there are no entries
  std::vector<ServiceEntry> Entries;
};

// Every service, running or not, in the system's order. Waits at most two seconds in all.
// Windows: OpenSCManagerA with access 0xF003F, EnumServicesStatusA. POSIX: the service units of
// systemd over the system bus, through libsystemd, looked up at run time.
ServiceListing ListServices();
