#include "platform/computer.h"

#include "platform/windows/system.h"

std::optional<std::string> ShortComputerName() {
  char name[16] = {};
  DWORD size = 15;
  if (::GetComputerNameA(name, &size) == FALSE) {
    return std::nullopt;
  }
  return name;
}

std::optional<SystemVersion> QuerySystemVersion(VersionForm form) {
  static_assert(sizeof(OSVERSIONINFOEXA) == 156 && sizeof(OSVERSIONINFOA) == 148);
  OSVERSIONINFOEXA data = {};
  data.dwOSVersionInfoSize =
      form == VersionForm::kExtended ? sizeof(OSVERSIONINFOEXA) : sizeof(OSVERSIONINFOA);
  if (::GetVersionExA(reinterpret_cast<OSVERSIONINFOA*>(&data)) == FALSE) {
    return std::nullopt;
  }
  SystemVersion version;
  version.MajorVersion = data.dwMajorVersion;
  version.MinorVersion = data.dwMinorVersion;
  version.BuildNumber = data.dwBuildNumber;
  version.PlatformID = data.dwPlatformId;
  version.ServicePack = data.szCSDVersion;
  version.ServicePackMajor = data.wServicePackMajor;
  version.ServicePackMinor = data.wServicePackMinor;
  version.SuiteMask = data.wSuiteMask;
  version.ProductType = data.wProductType;
  return version;
}

SystemInfo QuerySystemInfo() {
  SYSTEM_INFO data = {};
  ::GetSystemInfo(&data);
  SystemInfo info;
  info.ProcessorArchitecture = data.wProcessorArchitecture;
  info.NumberOfProcessors = data.dwNumberOfProcessors;
  info.ProcessorType = data.dwProcessorType;
  info.ProcessorLevel = data.wProcessorLevel;
  return info;
}
