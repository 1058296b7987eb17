#include "history/ini_file.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "tests/support/scratch_history.h"

namespace {

TEST(IniFile, KeepsEveryValueOnOneLine) {
  const ScratchHistory scratch;
  CIniFile file(scratch.In("a.ini"));
  const std::pair<const char*, const char*> cases[] = {
      {"one\ntwo", "one two"},
      {"one\r\ntwo\rthree", "one two three"},
      {"x\n[History]\nCount=9", "x [History] Count=9"},
      {"\n", ""},
  };
  for (const auto& [written, read] : cases) {
    EXPECT_EQ(file.WriteString("a]b\n=c", "Key", written), 0);
    EXPECT_EQ(CIniFile(file.Path).ReadString("a]b =c", "Key", "none", 256), read);
    EXPECT_EQ(file.ReadString("a]b\n=c", "Key", "none", 256), read);
  }
  EXPECT_EQ(file.GetSectionNames(), std::vector<std::string>{"a]b =c"});
  EXPECT_TRUE(file.WriteInt("S\n", "Number", -12));
  EXPECT_EQ(file.ReadInt("s\n", "NUMBER", 5), -12);
  WriteFileText(file.Path, std::string("[S]\nKey=a\0b\n", 12));
  EXPECT_EQ(file.ReadString("S", "Key", "", 256), "a");
  EXPECT_FALSE(CIniFile(scratch.In("missing/a.ini")).WriteInt("S", "K", 1));
}

TEST(IniFile, ListsSectionsAsFarAsTheyFit) {
  const ScratchHistory scratch;
  const CIniFile file(scratch.In("a.ini"));
  EXPECT_TRUE(file.GetSectionNames().empty());
  // 10 names of 1000 bytes with their ends, and one that ends at, before or after the limit.
  const std::pair<size_t, const char*> cases[] = {
      {227, "[after]\n"}, {228, "[after]\n"}, {229, "[after]\n"}, {229, ""}, {900, ""}};
  for (const auto& [last, after] : cases) {
    std::vector<std::string> names;
    std::string text;
    for (char c = 'a'; c <= 'k'; ++c) {
      names.emplace_back(c < 'k' ? 1000 : last, c);
      text += '[' + names.back() + "]\n";
    }
    scratch.Make("a.ini", text + after);
    names.back().resize(std::min<size_t>(last, 228));
    EXPECT_EQ(file.GetSectionNames(), names);
  }
}

}  // namespace
