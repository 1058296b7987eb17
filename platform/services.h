#pragma once

#include <chrono>
#include <cstdint>
#include <string>
#include <vector>

struct ServiceEntry {
  std::string ServiceName;
  std::string DisplayName;
  // 1 stopped, 2 starting, 3 stopping, 4 running, 5 about to continue, 6 about to pause, 7 paused.
  // POSIX: 1 inactive or failed, 2 activating, 3 deactivating, 4 active, 5 reloading, 0 any other.
  uint32_t CurrentState = 0;
};

struct ServiceListing {
  uint32_t Error = 0;  // the system's code for the step that failed; then there are no entries
  std::vector<ServiceEntry> Entries;
};

// The machine's services in the system's order.
// Windows: OpenSCManagerA with access 0xF003F and EnumServicesStatusA for all Win32 services,
// running or not.
// POSIX: ListUnits of systemd over the system bus, through libsystemd, looked up at run time. These
// are the service units that systemd has in memory: all that run or have failed, and those stopped
// ones that another unit refers to; a stopped unit that nothing refers to is missing. Units with
// the load state "not-found" are left out.
// It returns after at most the limit; then the error is ERROR_TIMEOUT (Windows) or ETIMEDOUT.
ServiceListing ListServices(std::chrono::milliseconds limit);
