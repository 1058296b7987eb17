// What the platform layer makes of the calls of Windows.

#include <gtest/gtest.h>

#include <tuple>

#include "platform/registry.h"
#include "platform/windows/file_entry.h"
#include "platform/windows/system.h"
#include "platform/windows/time_limit.h"

namespace {

using namespace std::chrono_literals;

TEST(FileEntry, IsALinkByItsTag) {
  const std::tuple<DWORD, DWORD, bool> cases[] = {
      {FILE_ATTRIBUTE_DIRECTORY, 0, false},
      {FILE_ATTRIBUTE_NORMAL, IO_REPARSE_TAG_SYMLINK, false},  // the field has no meaning here
      {FILE_ATTRIBUTE_REPARSE_POINT, IO_REPARSE_TAG_SYMLINK, true},
      {FILE_ATTRIBUTE_REPARSE_POINT | FILE_ATTRIBUTE_DIRECTORY, IO_REPARSE_TAG_MOUNT_POINT, true},
      {FILE_ATTRIBUTE_REPARSE_POINT | FILE_ATTRIBUTE_DIRECTORY, 0, true},  // Wine returns no tag
      {FILE_ATTRIBUTE_REPARSE_POINT, 0xA000001D, true},   // a link of the Linux subsystem
      {FILE_ATTRIBUTE_REPARSE_POINT, 0x9000001A, false},  // a file kept in the cloud
      {FILE_ATTRIBUTE_REPARSE_POINT, 0x80000013, false},  // a deduplicated file
  };
  for (const auto& [attributes, tag, isLink] : cases) {
    WIN32_FIND_DATAA entry = {};
    entry.dwFileAttributes = attributes;
    entry.dwReserved0 = tag;
    EXPECT_EQ(IsLink(entry), isLink) << std::hex << attributes << ' ' << tag;
  }
}

// Every Windows has this key and value.
TEST(Registry, IsTheOneOfTheSystem) {
  const std::string key = "Software\\Microsoft\\WINDOWS NT\\CurrentVersion";
  const auto read = [](const std::string& path, size_t size) {
    return ReadRegistryData(path, "CURRENTVERSION", size, RegistryAccess::kQueryValue);
  };
  const RegistryData data = read(key, 100);
  EXPECT_EQ(data.Type, kRegistryText);
  ASSERT_GT(data.Bytes.size(), 1U);
  EXPECT_EQ(data.Bytes.back(), '\0');
  EXPECT_EQ(read(key + '\\', 100).Bytes, data.Bytes);
  EXPECT_EQ(read('\\' + key, 100).Type, 0U);
  EXPECT_EQ(read(key, data.Bytes.size()).Bytes, data.Bytes);
  EXPECT_EQ(read(key, data.Bytes.size() - 1).Bytes, "");
  EXPECT_EQ(read(key, data.Bytes.size() - 1).Type, kRegistryText);
  EXPECT_EQ(read(key + "\\none", 100).Type, 0U);
  EXPECT_FALSE(EnumRegistryValueNames(key).empty());
  EXPECT_FALSE(EnumRegistrySubKeys("SOFTWARE\\Microsoft").empty());
  EXPECT_TRUE(EnumRegistrySubKeys("no such key").empty());
}

TEST(TimeLimit, IsForAllCallsTogether) {
  TimeLimit limit(200ms);
  EXPECT_EQ(limit.Call([] { return std::string("in time"); }), "in time");
  const auto begin = std::chrono::steady_clock::now();
  const auto late = [] {
    ::Sleep(/*dwMilliseconds=*/20'000);
    return 1;
  };
  EXPECT_EQ(limit.Call(late), std::nullopt);
  EXPECT_EQ(limit.Call([] { return 2; }), std::nullopt);
  EXPECT_LT(std::chrono::steady_clock::now() - begin, 10s);
}

}  // namespace
