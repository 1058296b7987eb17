#include "history/ini_file.h"

#include <gtest/gtest.h>

#include "history/locations.h"
#include "tests/fake_machine.h"

namespace {

TEST(IniFile, KeepsEveryValueOnOneLine) {
  const ScratchHistory scratch;
  CIniFile file(JoinPath(scratch.Root, "a.ini"));
  const std::pair<const char*, const char*> cases[] = {
      {"one\ntwo", "one two"},
      {"one\r\ntwo\rthree", "one two three"},
      {"x\n[History]\nCount=9", "x [History] Count=9"},
      {"\n", ""},
  };
  for (const auto& [written, read] : cases) {
    EXPECT_EQ(file.WriteString("a]b\n=c", "Key", written), 0);
    EXPECT_EQ(file.ReadString("a]b =c", "Key", "none", 256), read);
    EXPECT_EQ(file.ReadString("a]b\n=c", "Key", "none", 256), read);
  }
  EXPECT_EQ(file.GetSectionNames(), std::vector<std::string>{"a]b =c"});
}

TEST(IniFile, ReadsWhatItsSizeHolds) {
  const ScratchHistory scratch;
  const std::string path = JoinPath(scratch.Root, "a.ini");
  CIniFile file(path);
  const std::string stored(300, 'v');
  EXPECT_EQ(file.ReadString("S", "Key", stored, 256), stored.substr(0, 255));
  EXPECT_FALSE(FileExists(path));
  file.WriteString("S", "Key", stored);
  EXPECT_EQ(CIniFile(path).ReadString("s", "KEY", "", 256), stored.substr(0, 255));
  EXPECT_EQ(CIniFile(path).ReadString("s", "KEY", "", 400), stored);
  EXPECT_TRUE(file.WriteInt("S", "Number", -12));
  EXPECT_EQ(file.ReadInt("S", "Number", 5), -12);
  EXPECT_EQ(file.ReadInt("S", "Other", 5), 5);
  EXPECT_FALSE(
      CIniFile(JoinPath(JoinPath(scratch.Root, "missing"), "a.ini")).WriteInt("S", "K", 1));
}

TEST(IniFile, ListsSectionsAsFarAsTheyFit) {
  const ScratchHistory scratch;
  // 10 names of 1000 bytes with their ends, and one that ends at, before or behind the limit.
  struct {
    size_t LastLength;
    size_t ReadLength;
  } const cases[] = {{227, 227}, {228, 228}, {229, 228}, {900, 228}};
  for (const auto& test : cases) {
    CIniFile file(JoinPath(scratch.Root, std::to_string(test.LastLength) + ".ini"));
    for (char c = 'a'; c < 'k'; ++c) {
      file.WriteString(std::string(1000, c), "Key", "");
    }
    file.WriteString(std::string(test.LastLength, 'z'), "Key", "");
    file.WriteString("behind", "Key", "");
    const std::vector<std::string> names = file.GetSectionNames();
    ASSERT_GE(names.size(), 11U);
    EXPECT_EQ(names[9], std::string(1000, 'j'));
    EXPECT_EQ(names[10], std::string(test.ReadLength, 'z'));
    EXPECT_EQ(names.size(), 11U);
  }
  EXPECT_TRUE(CIniFile(JoinPath(scratch.Root, "none.ini")).GetSectionNames().empty());
}

}  // namespace
