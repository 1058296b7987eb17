#include "inventory/computer_info.h"

#include <gtest/gtest.h>

#include <sstream>

#include "inventory/process_list.h"
#include "tests/support/fake_machine.h"
#include "tests/support/file_text.h"

namespace {

// The machine that the first columns of a line of the golden table describe. A registry text
// instead of the product type is for a system that knows only the short version.
void SetMachine(const std::string& line) {
  Machine() = FakeMachine();
  SystemVersion version;
  SystemInfo& system = Machine().System;
  std::string product;
  std::istringstream columns(line);
  columns >> version.PlatformID >> version.MajorVersion >> version.MinorVersion >> product;
  columns >> std::hex >> version.SuiteMask >> std::dec;
  columns >> system.ProcessorArchitecture >> system.ProcessorLevel >> system.ProcessorType;
  const bool isExtended = product.size() == 1;
  if (isExtended) {
    version.ProductType = static_cast<uint8_t>(product[0] - '0');
  }
  (isExtended ? Machine().ExtendedVersion : Machine().ShortVersion) = version;
  Machine().SetText("SYSTEM\\CurrentControlSet\\Control\\ProductOptions", "ProductType",
                    isExtended ? "WINNT" : product);
}

TEST(ComputerInfo, IsThatOfTheGoldenTable) {
  std::istringstream lines(Golden("computers.txt"));
  std::string line;
  ASSERT_TRUE(std::getline(lines, line));  // names the columns
  while (std::getline(lines, line)) {
    SetMachine(line);
    CComputerInfo computer;
    EXPECT_EQ(computer.Collect(), 0);
    EXPECT_EQ(computer.IsDomainController, computer.Type == "Domain Controller") << line;
    const std::string family = IsWindowsNTFamily() ? "|NT|" : "|95|";
    EXPECT_EQ('|' + computer.OSName + '|' + computer.Type + family + computer.CPU + '|',
              line.substr(line.find('|')));
  }
}

// A text of 80 bytes with its terminator is the longest; the key is opened for queries alone.
TEST(ComputerInfo, AsksTheRegistryForNoMoreThanItNeeds) {
  SetMachine("2 4 0 WINNT 0 0 0 0");
  CComputerInfo().Collect();
  const std::vector<std::string> asked = {
      "SYSTEM\\CurrentControlSet\\Control\\ProductOptions|ProductType|80|1"};
  EXPECT_EQ(Machine().RegistryQuestions, asked);
}

}  // namespace
