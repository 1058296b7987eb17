#include "inventory/computer_info.h"

#include <gtest/gtest.h>

#include <sstream>

#include "inventory/process_list.h"
#include "tests/fake_machine.h"

namespace {

// What a line of a golden table has in front of its names.
std::istringstream Columns(const std::string& line) {
  Machine() = FakeMachine();
  return std::istringstream(line.substr(0, line.find('|')));
}

// Sets a machine and gives its names as they stand in the line. A registry text in the place of the
// product type goes with a system that knows the short version alone.
std::string SystemNames(const std::string& line) {
  SystemVersion version;
  std::string product;
  std::istringstream columns = Columns(line);
  columns >> version.PlatformID >> version.MajorVersion >> version.MinorVersion >> product;
  columns >> std::hex >> version.SuiteMask;
  const bool isExtended = product.size() == 1;
  if (isExtended) {
    version.ProductType = static_cast<uint8_t>(product[0] - '0');
  }
  (isExtended ? Machine().ExtendedVersion : Machine().ShortVersion) = version;
  Machine().SetText("SYSTEM\\CurrentControlSet\\Control\\ProductOptions", "ProductType",
                    isExtended ? "WINNT" : product);
  CComputerInfo computer;
  EXPECT_EQ(computer.Collect(), 0);
  EXPECT_EQ(computer.IsDomainController, computer.Type == "Domain Controller") << line;
  return '|' + computer.OSName + '|' + computer.Type + (IsWindowsNTFamily() ? "|NT|" : "|95|");
}

std::string ProcessorName(const std::string& line) {
  SystemInfo& system = Machine().System;
  Columns(line) >> system.ProcessorArchitecture >> system.ProcessorLevel >> system.ProcessorType;
  CComputerInfo computer;
  computer.Collect();
  return '|' + computer.CPU + '|';
}

TEST(ComputerInfo, NamesSystemsAndProcessorsAsTheGoldenTables) {
  const std::pair<const char*, std::string (*)(const std::string&)> tables[] = {
      {"computer_names.txt", SystemNames}, {"processor_names.txt", ProcessorName}};
  for (const auto& [table, namesOf] : tables) {
    std::istringstream lines(Golden(table));
    std::string line;
    ASSERT_TRUE(std::getline(lines, line));  // tells what the columns are
    while (std::getline(lines, line)) {
      EXPECT_EQ(namesOf(line), line.substr(line.find('|'))) << line;
    }
  }
}

}  // namespace
