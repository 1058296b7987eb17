#include "inventory/computer_info.h"

#include <gtest/gtest.h>

#include "tests/fake_machine.h"

namespace {

struct OSCase {
  SystemVersion Version;
  const char* OSName;
  const char* Type;
};

SystemVersion Version(uint32_t platform, uint32_t major, uint32_t minor, uint8_t productType = 0,
                      uint16_t suiteMask = 0) {
  SystemVersion version;
  version.PlatformID = platform;
  version.MajorVersion = major;
  version.MinorVersion = minor;
  version.ProductType = productType;
  version.SuiteMask = suiteMask;
  return version;
}

TEST(ComputerInfo, NamesTheSystemByItsExtendedVersion) {
  const OSCase cases[] = {
      {Version(0, 3, 1), "Microsoft Win32s", ""},
      {Version(1, 4, 0), "Microsoft Windows 95 ", ""},
      {Version(1, 4, 10), "Microsoft Windows 98 ", ""},
      {Version(1, 4, 90), "Microsoft Windows Millennium Edition", ""},
      {Version(1, 4, 1), "", ""},
      {Version(1, 5, 0, 1), "", ""},
      {Version(2, 4, 0, 1), "Microsoft Windows NT 3.5.1 or earlier Workstation 4.0", "Workstation"},
      {Version(2, 5, 0, 1), "Microsoft Windows 2000 Professional", "Workstation"},
      {Version(2, 5, 1, 1, 0x200), "Microsoft Windows XP Home Edition", "Workstation"},
      {Version(2, 5, 1, 1, 0x100), "Microsoft Windows XP Professional", "Workstation"},
      {Version(2, 10, 0, 1), " Professional", "Workstation"},
      {Version(2, 5, 2, 3, 0x82), "Microsoft Windows Server 2003 family Datacenter Edition ",
       "Server"},
      {Version(2, 5, 2, 3, 0x402), "Microsoft Windows Server 2003 family Enterprise Edition ",
       "Server"},
      {Version(2, 5, 2, 3, 0x400), "Microsoft Windows Server 2003 family Web Edition ", "Server"},
      {Version(2, 5, 2, 3, 0x410), "Microsoft Windows Server 2003 family Standard Edition ",
       "Server"},
      {Version(2, 5, 0, 2, 0x80), "Microsoft Windows 2000 Datacenter Server ", "Domain Controller"},
      {Version(2, 5, 0, 3, 0x2), "Microsoft Windows 2000 Advanced Server ", "Server"},
      {Version(2, 5, 0, 3), "Microsoft Windows 2000 Server ", "Server"},
      {Version(2, 5, 1, 3), "Server 4.0 ", "Server"},
      {Version(2, 6, 1, 3, 0x2), " Server 4.0, Enterprise Edition ", "Server"},
      {Version(2, 10, 0, 2), "Server 4.0 ", "Domain Controller"},
      {Version(2, 5, 3, 0), "", ""},
      {Version(100, 6, 1, 1), "", ""},
  };
  for (const OSCase& test : cases) {
    Machine() = FakeMachine();
    Machine().ExtendedVersion = test.Version;
    CComputerInfo computer;
    EXPECT_EQ(computer.Collect(), 0);
    EXPECT_EQ(computer.OSName, test.OSName);
    EXPECT_EQ(computer.Type, test.Type) << test.OSName;
    EXPECT_EQ(computer.IsDomainController, computer.Type == "Domain Controller") << test.OSName;
  }
}

TEST(ComputerInfo, AsksTheRegistryWithoutTheExtendedVersion) {
  const std::pair<const char*, const char*> cases[] = {
      {"WINNT", " Windows NT 4.0 Workstation SP5 and earlier "},
      {"LanmanNT", " Windows NT 4.0 Server SP5 and earlier "},
      {"servernt", "Windows NT 4.0 Advanced Server SP5 and earlier "},
      {"WINNT2", "Microsoft Windows NT 3.5.1 or earlier"},
  };
  for (const auto& [product, name] : cases) {
    Machine() = FakeMachine();
    Machine().ShortVersion = Version(2, 4, 0, 1);
    Machine().SetText("SYSTEM\\CurrentControlSet\\Control\\ProductOptions", "ProductType", product);
    CComputerInfo computer;
    computer.Collect();
    EXPECT_EQ(computer.OSName, name);
    EXPECT_EQ(computer.Type, "");
  }
}

TEST(ComputerInfo, NamesTheProcessor) {
  struct {
    SystemInfo System;
    const char* CPU;
  } const cases[] = {
      {{0, 1, 0, 4}, "Intel 80486"},
      {{0, 1, 0, 5}, "Intel Pentium"},
      {{0, 1, 0, 6}, "INTEL "},
      {{0, 1, 586, 6}, "Intel Pentium"},
      {{1, 1, 0, 0}, "MIPS "},
      {{2, 1, 0, 0}, "ALPHA "},
      {{3, 1, 0, 0}, "PPC"},
      {{6, 1, 0, 0}, "IA64"},
      {{9, 1, 8664, 6}, "AMD64"},
      {{10, 1, 0, 0}, "IA32_ON_WIN64"},
      {{9, 1, 386, 6}, "Intel 386"},
      {{0xFFFF, 1, 486, 0}, "Intel 486"},
      {{0xFFFF, 1, 0, 0}, "Unknown Processor"},
  };
  for (const auto& test : cases) {
    Machine() = FakeMachine();
    Machine().System = test.System;
    CComputerInfo computer;
    computer.Collect();
    EXPECT_EQ(computer.CPU, test.CPU);
  }
}

}  // namespace
