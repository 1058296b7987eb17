// What every machine reports about itself.

#include <algorithm>
#include <chrono>
#include <cstdlib>

#include "platform/accounts.h"
#include "platform/computer.h"
#include "platform/known_folders.h"
#include "platform/processes.h"
#include "platform/services.h"
#include "tests/platform/contract.h"

TEST(Computer, HasAVersionAndProcessors) {
  EXPECT_LT(ShortComputerName().value_or("").size(), 15U);
  const SystemVersion version = QuerySystemVersion(VersionForm::kExtended).value();
  EXPECT_GT(version.MajorVersion, 0U);
  EXPECT_EQ(version.PlatformID <= 2, isWindows);
  const SystemInfo info = QuerySystemInfo();
  EXPECT_GT(info.NumberOfProcessors, 0U);
#if defined(__x86_64__) || defined(_M_X64)
  EXPECT_EQ(info.ProcessorArchitecture, 9);
#endif
  EXPECT_TRUE(info.ProcessorLevel > 0 || info.ProcessorArchitecture == 0xFFFF);
}

TEST(KnownFolders, IncludeCommonApplicationData) {
  const char* variable = std::getenv("ORX_COMMON_APPDATA");
  static std::string restored = "ORX_COMMON_APPDATA="s + (variable == nullptr ? "" : variable);
  ::putenv(const_cast<char*>("ORX_COMMON_APPDATA="));  // Windows does not read it
  const std::string folder = GetFolderPath(kCommonAppDataFolder);
  ::putenv(restored.data());
  EXPECT_TRUE(fs::is_directory(folder)) << folder;
  EXPECT_TRUE(isWindows || folder == "/var/lib") << folder;
  EXPECT_EQ(GetFolderPath(/*csidl=*/9999), "");
}

TEST(Processes, IncludeThisOne) {
  const std::vector<uint32_t> ids = ListProcessIDs().value();
  EXPECT_NE(std::find(ids.begin(), ids.end(), OwnProcessID()), ids.end());
  EXPECT_EQ(FirstModuleOf(OwnProcessID()).value().BaseName,
            isWindows ? "orx_platform_tests.exe" : "orx_platform_tests");
  EXPECT_FALSE(FirstModuleOf(4294967292U));
}

TEST(Accounts, HaveADomainAndAtMost127Bytes) {
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

TEST(Services, AreListedOrAnErrorIsReturned) {
  const ServiceListing listing = ListServices(std::chrono::seconds(2));
  EXPECT_TRUE(listing.Error == 0 || listing.Entries.empty());
  for (const ServiceEntry& entry : listing.Entries) {
    EXPECT_NE(entry.ServiceName, "");
    EXPECT_LE(entry.CurrentState, 7U);
  }
}
