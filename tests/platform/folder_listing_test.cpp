#include "platform/folder_listing.h"

#include <ctime>
#include <numeric>
#include <set>
#include <tuple>

#include "tests/platform/contract.h"

namespace {

using Files = Platform;

// The names in a folder, sorted, each followed by a blank.
std::string Names(const std::string& folder) {
  std::set<std::string> names;
  for (const FolderEntry& entry : ListFolder(folder)) {
    names.insert(entry.Name == "." || entry.Name == ".." ? "" : entry.Name + ' ');
  }
  return std::accumulate(names.begin(), names.end(), ""s);
}

TEST_F(Files, AreListedWithTheirProperties) {
  Make("plain", "12345");
  fs::permissions(Make("fixed", ""), fs::perms::owner_read);
  Make(".dot", "");
  Make("folder/");
  constexpr uint32_t readOnly = 1;
  for (const auto& [name, size, attributes] : ListFolder(Root)) {
    EXPECT_EQ(attributes, FileAttributes(In(name))) << name;
    const bool isFolder = name == "folder" || name == "." || name == "..";
    EXPECT_EQ((attributes & kFolderAttribute) != 0, isFolder) << name;
    EXPECT_EQ((attributes & readOnly) != 0, name == "fixed") << name;
    EXPECT_TRUE(isFolder || size == (name == "plain" ? 5 : 0)) << name;
  }
  EXPECT_EQ(Names(Root), ".dot fixed folder plain ");
  EXPECT_EQ(Names(In("folder")), "");
  EXPECT_TRUE(ListFolder(In("none")).empty() && ListFolder(In("plain")).empty());
  fs::permissions(In("fixed"), fs::perms::owner_all);
}

TEST_F(Files, KeepTheTimeOfTheirLastWrite) {
  const std::time_t before = std::time(nullptr);
  Make("file", "x");
  Make("folder/");
  for (const char* name : {"file", "folder"}) {
    const CalendarTime time = LastWriteTime(In(name)).value();
    tm fields = {};
    std::tie(fields.tm_year, fields.tm_mon, fields.tm_mday, fields.tm_hour, fields.tm_min,
             fields.tm_sec, fields.tm_isdst) =
        std::tuple(time.Year - 1900, time.Month - 1, time.Day, time.Hour, time.Minute, time.Second,
                   -1);
    EXPECT_NEAR(std::difftime(std::mktime(&fields), before), 0, 5);
  }
}

}  // namespace
