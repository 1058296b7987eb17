// What every machine answers about itself, its accounts and its services.

#include <chrono>

#include "platform/accounts.h"
#include "platform/computer.h"
#include "platform/services.h"
#include "tests/platform/contract.h"

TEST(Computer, HasAVersionAndProcessors) {
  EXPECT_LT(ShortComputerName().value_or("").size(), 15U);
  const SystemVersion version = QuerySystemVersion(VersionForm::kExtended).value();
  EXPECT_GT(version.MajorVersion, 0U);
  EXPECT_EQ(version.PlatformID <= 2, isWindows);
  const SystemInfo info = QuerySystemInfo();
  EXPECT_GT(info.NumberOfProcessors, 0U);
  EXPECT_TRUE(info.ProcessorLevel > 0 || info.ProcessorArchitecture == 0xFFFF);
}

TEST(Accounts, HaveDomainsAndFitTheirBuffer) {
  EXPECT_NE(DomainUserName().value().find('\\'), std::string::npos);
  EXPECT_EQ(WorkstationUserName().value().find('\\'), std::string::npos);
  for (const std::string& group : ListLocalGroups("")) {
    EXPECT_LT(group.size(), 128U);
    for (const std::string& member : ListLocalGroupMembers("", group)) {
      EXPECT_LT(member.size(), 128U);
      EXPECT_TRUE(member.empty() || member.find('\\') != std::string::npos) << member;
    }
  }
  EXPECT_TRUE(ListLocalGroupMembers("", "no such group").empty());
}

TEST(Services, AreListedOrRefused) {
  const ServiceListing listing = ListServices(std::chrono::seconds(2));
  EXPECT_TRUE(listing.Error == 0 || listing.Entries.empty());
  for (const ServiceEntry& entry : listing.Entries) {
    EXPECT_NE(entry.ServiceName, "");
    EXPECT_LE(entry.CurrentState, 7U);
  }
}
