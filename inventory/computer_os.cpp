#include <string>

#include "inventory/computer_info.h"
#include "platform/ascii_case.h"
#include "platform/registry.h"

namespace {

constexpr uint32_t platformWin32s = 0;
constexpr uint32_t platformWindows95 = 1;
constexpr uint32_t platformNT = 2;

constexpr uint16_t suiteEnterprise = 0x2;
constexpr uint16_t suiteDatacenter = 0x80;
constexpr uint16_t suitePersonal = 0x200;
constexpr uint16_t suiteBlade = 0x400;

std::string Windows95Name(const SystemVersion& version) {
  if (version.MajorVersion != 4) {
    return "";
  }
  switch (version.MinorVersion) {
    case 0:
      return "Microsoft Windows 95 ";
    case 10:
      return "Microsoft Windows 98 ";
    case 90:
      return "Microsoft Windows Millennium Edition";
    default:
      return "";
  }
}

std::string NTFamilyName(const SystemVersion& version) {
  if (version.MajorVersion <= 4) {
    return "Microsoft Windows NT 3.5.1 or earlier";
  }
  if (version.MajorVersion != 5) {
    return "";
  }
  switch (version.MinorVersion) {
    case 2:
      return "Microsoft Windows Server 2003 family";
    case 1:
      return "Microsoft Windows XP";
    case 0:
      return "Microsoft Windows 2000";
    default:
      return "";
  }
}

}  // namespace

int32_t CComputerInfo::CollectOSInfo() {
  std::optional<SystemVersion> version = QuerySystemVersion(VersionForm::kExtended);
  const bool isExtended = version.has_value();
  if (!isExtended) {
    version = QuerySystemVersion(VersionForm::kShort);
  }
  if (!version) {
    return 0;
  }
  MajorVersion = version->MajorVersion;
  MinorVersion = version->MinorVersion;
  BuildNumber = version->BuildNumber;
  ServicePackMajor = version->ServicePackMajor;
  ServicePackMinor = version->ServicePackMinor;
  ProductType = version->ProductType;
  ServicePack = version->ServicePack;
  IsDomainController = false;
  NameOS(*version, isExtended);
  return 0;
}

void CComputerInfo::NameOS(const SystemVersion& version, bool isExtended) {
  switch (version.PlatformID) {
    case platformWin32s:
      OSName = "Microsoft Win32s";
      return;
    case platformWindows95:
      OSName = Windows95Name(version);
      return;
    case platformNT:
      OSName = NTFamilyName(version);
      break;
    default:
      return;
  }
  if (isExtended) {
    AddEdition(version);
  } else {
    NameOSByRegistry();
  }
}

void CComputerInfo::AddEdition(const SystemVersion& version) {
  switch (version.ProductType) {
    case 1:
      Type = "Workstation";
      AddWorkstationEdition(version);
      return;
    case 2:
      Type = "Domain Controller";
      IsDomainController = true;
      AddServerEdition(version);
      return;
    case 3:
      Type = "Server";
      AddServerEdition(version);
      return;
    default:
      return;
  }
}

void CComputerInfo::AddWorkstationEdition(const SystemVersion& version) {
  if (version.MajorVersion == 4) {
    OSName += " Workstation 4.0";
  } else if ((version.SuiteMask & suitePersonal) != 0) {
    OSName += " Home Edition";
  } else {
    OSName += " Professional";
  }
}

void CComputerInfo::AddServerEdition(const SystemVersion& version) {
  const bool isDatacenter = (version.SuiteMask & suiteDatacenter) != 0;
  const bool isEnterprise = (version.SuiteMask & suiteEnterprise) != 0;
  if (version.MajorVersion == 5 && version.MinorVersion == 2) {
    // For the web edition the mask must have this bit and no other.
    OSName += isDatacenter                      ? " Datacenter Edition "
              : isEnterprise                    ? " Enterprise Edition "
              : version.SuiteMask == suiteBlade ? " Web Edition "
                                                : " Standard Edition ";
  } else if (version.MajorVersion == 5 && version.MinorVersion == 0) {
    OSName += isDatacenter   ? " Datacenter Server "
              : isEnterprise ? " Advanced Server "
                             : " Server ";
  } else {
    // This replaces the name of the family, also for newer systems.
    OSName = isEnterprise ? " Server 4.0, Enterprise Edition " : "Server 4.0 ";
  }
}

void CComputerInfo::NameOSByRegistry() {
  const RegistryData data = ReadRegistryData("SYSTEM\\CurrentControlSet\\Control\\ProductOptions",
                                             "ProductType", 80, RegistryAccess::kQueryValue);
  const std::string product = data.Bytes.substr(0, data.Bytes.find('\0'));
  if (EqualsIgnoringCase(product, "WINNT")) {
    OSName = " Windows NT 4.0 Workstation SP5 and earlier ";
  } else if (EqualsIgnoringCase(product, "LANMANNT")) {
    OSName = " Windows NT 4.0 Server SP5 and earlier ";
  } else if (EqualsIgnoringCase(product, "SERVERNT")) {
    OSName = "Windows NT 4.0 Advanced Server SP5 and earlier ";
  }
}
