#pragma once

#include <cstdint>
#include <optional>
#include <string>

// The machine's short (NetBIOS) name; nothing if it is empty or has more than 14 bytes.
// Windows: GetComputerNameA with a size of 15. POSIX: the host name (uname) up to its first dot.
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
  std::string ServicePack;  // a text of the system; POSIX: the kernel's name and release
  uint16_t ServicePackMajor = 0;
  uint16_t ServicePackMinor = 0;
  uint16_t SuiteMask = 0;
  uint8_t ProductType = 0;  // 1 workstation, 2 domain controller, 3 server
};

// Nothing if the system does not know the form.
// Windows: GetVersionExA. POSIX: uname; the extended form only.
std::optional<SystemVersion> QuerySystemVersion(VersionForm form);

struct SystemInfo {
  uint16_t ProcessorArchitecture = 0;  // 0 Intel, 9 AMD64, 0xFFFF unknown, and so on
  uint32_t NumberOfProcessors = 0;
  uint32_t ProcessorType = 0;   // 386, 486, 586, or another number
  uint16_t ProcessorLevel = 0;  // the processor family
};

// Always succeeds; what the system does not know is 0, or 0xFFFF for the architecture, and there is
// at least one processor. Windows: GetSystemInfo. POSIX: uname, sysconf, /proc/cpuinfo.
SystemInfo QuerySystemInfo();
