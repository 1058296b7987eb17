#pragma once

#include <cstdint>
#include <optional>
#include <string>

// What machine and system this is.

// The machine's short (NetBIOS) name; nothing if it has 15 characters or more.
// Windows: GetComputerNameA with a size of 15. POSIX: the host name up to its first point.
std::optional<std::string> ShortComputerName();

enum class VersionForm {
  kShort,     // without the last four fields below (size field 148)
  kExtended,  // all fields (size field 156)
};

struct SystemVersion {
  uint32_t MajorVersion = 0;
  uint32_t MinorVersion = 0;
  uint32_t BuildNumber = 0;
  uint32_t PlatformID = 0;  // Windows: 0, 1 or 2. POSIX: a number that is none of these
  std::string ServicePack;  // the system's own version text
  uint16_t ServicePackMajor = 0;
  uint16_t ServicePackMinor = 0;
  uint16_t SuiteMask = 0;
  uint8_t ProductType = 0;  // 1 workstation, 2 domain controller, 3 server
};

// Nothing if the system does not know the form.
// Windows: GetVersionExA. POSIX: uname, its name and release as the service pack text.
std::optional<SystemVersion> QuerySystemVersion(VersionForm form);

struct SystemInfo {
  uint16_t ProcessorArchitecture = 0;  // 0 Intel, 9 AMD64, 0xFFFF unknown, and so on
  uint32_t NumberOfProcessors = 0;
  uint32_t ProcessorType = 0;   // 386, 486, 586, or another number
  uint16_t ProcessorLevel = 0;  // the processor family
};

// Windows: GetSystemInfo. POSIX: uname, sysconf, /proc/cpuinfo.
SystemInfo QuerySystemInfo();
