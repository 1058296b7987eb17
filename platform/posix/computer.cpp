#include "platform/computer.h"

#include <sys/utsname.h>
#include <unistd.h>

#include <cstdlib>
#include <string_view>

#include "platform/posix/host_name.h"
#include "platform/posix/text_file.h"

std::optional<std::string> ShortComputerName() { return ShortNameOf(HostName()); }

std::optional<SystemVersion> QuerySystemVersion(VersionForm form) {
  utsname system = {};
  if (form != VersionForm::kExtended || ::uname(&system) != 0) {
    return std::nullopt;
  }
  SystemVersion version;
  constexpr uint32_t noWindows = 100;
  version.PlatformID = noWindows;
  version.ServicePack = std::string(system.sysname) + ' ' + system.release;
  char* end = system.release;
  version.MajorVersion = static_cast<uint32_t>(std::strtoul(end, &end, 10));
  if (*end == '.') {
    version.MinorVersion = static_cast<uint32_t>(std::strtoul(end + 1, &end, 10));
  }
  return version;
}

static uint16_t ArchitectureCode(std::string_view machine) {
  if (machine == "x86_64") {
    return 9;
  }
  if (machine.size() == 4 && machine.front() == 'i' && machine.ends_with("86")) {
    return 0;
  }
  return 0xFFFF;
}

// The number after "cpu family" of the first processor; 0 without one, as on other architectures.
static uint16_t ProcessorFamily() {
  const std::string text = ReadTextFile("/proc/cpuinfo").value_or("");
  const size_t line = text.find("cpu family");
  const size_t colon = text.find(':', line);
  return line == std::string::npos || colon == std::string::npos
             ? uint16_t{0}
             : static_cast<uint16_t>(std::strtoul(text.c_str() + colon + 1, nullptr, 10));
}

SystemInfo QuerySystemInfo() {
  SystemInfo info;
  utsname system = {};
  info.ProcessorArchitecture = ::uname(&system) == 0 ? ArchitectureCode(system.machine) : 0xFFFF;
  const long count = ::sysconf(_SC_NPROCESSORS_ONLN);
  info.NumberOfProcessors = count > 0 ? static_cast<uint32_t>(count) : 1;
  info.ProcessorLevel = ProcessorFamily();
  return info;
}
