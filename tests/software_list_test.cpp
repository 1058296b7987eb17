#include "inventory/software_list.h"

#include <gtest/gtest.h>

#include "tests/fake_machine.h"

namespace {

const std::string root =
    "SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Products\\";

TEST(SoftwareList, KeepsARecordForEveryProductKey) {
  Machine() = FakeMachine();
  Machine().SetText(root + "B\\InstallProperties", "DisplayName", "Reader");
  Machine().SetText(root + "B\\InstallProperties", "Publisher", "ZEK Ltd");
  Machine().SetKey(root + "A\\Usage");
  Machine().SetText(root + "C\\InstallProperties", "DisplayName", std::string(99, 'n'));
  Machine().SetText(root + "C\\InstallProperties", "InstallLocation", std::string(100, 'l'));
  CProductsList list;
  EXPECT_EQ(list.Collect(), 0);
  ASSERT_EQ(list.Products.size(), 3U);
  EXPECT_EQ(list.Products[0].DisplayName, "Reader");
  EXPECT_EQ(list.Products[0].Publisher, "ZEK Ltd");
  EXPECT_EQ(list.Products[1].DisplayName, "");
  EXPECT_EQ(list.Products[1].Language, 0);
  EXPECT_EQ(list.Products[2].DisplayName, std::string(99, 'n'));
  EXPECT_EQ(list.Products[2].InstallLocation, "");
}

TEST(SoftwareList, TakesTheLanguageFromTheStartOfAText) {
  const std::pair<const char*, int32_t> cases[] = {{"1033", 1033},   {" 1033,1031", 1033},
                                                   {"-2", -2},       {"", 0},
                                                   {"neutral 9", 0}, {"2147483648", INT32_MAX}};
  for (const auto& [text, number] : cases) {
    Machine() = FakeMachine();
    Machine().SetText(root + "A\\InstallProperties", "Language", text);
    CProductsList list;
    list.Collect();
    EXPECT_EQ(list.Products.at(0).Language, number) << text;
  }
}

TEST(SoftwareList, LetsThePublishersOfInterestThrough) {
  const std::pair<const char*, bool> cases[] = {
      {"Microsoft Corporation", true},
      {"MICROSOFT", false},
      {"microsoft", false},
      {"", false},
      {"Old InstallShield Co", true},
      {"The ZEK Lab", true},
      {"Zek", false},
      {"Orrin Software Ltd", true},
      {"Orrin", false},
      {"Other", false},
  };
  const CProductsList list;
  for (const auto& [publisher, isPrinted] : cases) {
    CProductInfo product;
    product.Publisher = publisher;
    EXPECT_EQ(list.Matches(product), isPrinted) << publisher;
  }
}

}  // namespace
