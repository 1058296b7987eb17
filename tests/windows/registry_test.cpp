#include "platform/registry.h"

#include <gtest/gtest.h>

namespace {

constexpr size_t limit = 100;

// Every Windows has this key and value.
TEST(Registry, IsTheOneOfTheSystem) {
  const std::string key = "Software\\Microsoft\\WINDOWS NT\\CurrentVersion";
  const auto read = [](const std::string& path, size_t size) {
    return ReadRegistryData(path, "CURRENTVERSION", size, RegistryAccess::kQueryValue);
  };
  const RegistryData data = read(key, limit);
  EXPECT_EQ(data.Type, kRegistryText);
  ASSERT_GT(data.Bytes.size(), 1U);
  EXPECT_EQ(data.Bytes.back(), '\0');
  EXPECT_EQ(read(key + '\\', limit).Bytes, data.Bytes);
  EXPECT_EQ(read('\\' + key, limit).Type, 0U);
  EXPECT_EQ(read(key, data.Bytes.size()).Bytes, data.Bytes);
  EXPECT_EQ(read(key, data.Bytes.size() - 1).Bytes, "");
  EXPECT_EQ(read(key, data.Bytes.size() - 1).Type, kRegistryText);
  EXPECT_EQ(read(key + "\\none", limit).Type, 0U);
  EXPECT_FALSE(EnumRegistryValueNames(key).empty());
  EXPECT_FALSE(EnumRegistrySubKeys("SOFTWARE\\Microsoft").empty());
  EXPECT_TRUE(EnumRegistrySubKeys("no such key").empty());
}

}  // namespace
