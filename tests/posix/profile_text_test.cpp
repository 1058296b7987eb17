#include "platform/posix/profile_text.h"

#include <gtest/gtest.h>

namespace {

TEST(ProfileText, ReadsFilesEditedByHand) {
  const ProfileText text(
      "\xEF\xBB\xBF[first]\r\n"
      "stray line\r\n"
      "Key = with blanks \t\r\n"
      "Empty=\n"
      "key=second of its name\n"
      "; Comment=1\n"
      "\n"
      "[broken\n"
      "a[b]=c\n"
      "  [ x]y ] behind\n"
      "Equals==a=b\n"
      "[]\n"
      "[FIRST]\n"
      "Late=1\n"
      "[last]\n"
      "Open=end");
  struct {
    const char* Section;
    const char* Key;
    std::optional<std::string_view> Value;
  } const cases[] = {
      {"first", "key", "with blanks"},
      {" First ", " KEY ", "with blanks"},
      {"first", "Empty", ""},
      {"first", "a[b]", "c"},
      {"first", "Comment", {}},
      {"first", "Late", {}},
      {"first", "Equals", {}},
      {"x]y", "Equals", "=a=b"},
      {"LAST", "Open", "end"},
      {"broken", "a[b]", {}},
      {"none", "Key", {}},
      {"stray line", "Key", {}},
  };
  for (const auto& test : cases) {
    EXPECT_EQ(text.Find(test.Section, test.Key), test.Value) << test.Section << ' ' << test.Key;
  }
  EXPECT_EQ(text.SectionNames(), (std::vector<std::string_view>{"first", "x]y", "FIRST", "last"}));
}

TEST(ProfileText, ChangesNothingButTheKey) {
  struct {
    const char* Before;
    const char* Section;
    const char* Key;
    const char* Value;
    const char* After;
  } const cases[] = {
      {"", "S", "K", "v", "[S]\nK=v\n"},
      {"[S]\nK=v\n", "s", "k", "", "[S]\nK=\n"},
      {"[S]\r\n K = old \r\nL=1\r\n", "S", "K", "new", "[S]\r\n K =new\r\nL=1\r\n"},
      {"[S]\nJ=1", "S", "K", "v", "[S]\nJ=1\nK=v\n"},
      {"[S]", "S", "K", "v", "[S]\nK=v\n"},
      {"[S]\nJ=1\n\n; note\n\n[T]\nK=t\n", "S", "K", "v", "[S]\nJ=1\n\n; note\nK=v\n\n[T]\nK=t\n"},
      {"stray", "S", "K", "v", "stray\n[S]\nK=v\n"},
      {"[S\nK=1\n", "S", "K", "v", "[S\nK=1\n[S]\nK=v\n"},
      {"[S]\nK=1\n[S]\nK=2\n", "S", "K", "v", "[S]\nK=v\n[S]\nK=2\n"},
  };
  for (const auto& test : cases) {
    ProfileText text(test.Before);
    text.Set(test.Section, test.Key, test.Value);
    EXPECT_EQ(text.Get(), test.After);
    EXPECT_EQ(text.Find(test.Section, test.Key), test.Value);
  }
}

TEST(ProfileText, KeepsItsPlacesThroughManyChanges) {
  ProfileText text("[History]\nCount=0\n");
  for (int i = 0; i < 200; ++i) {
    const std::string section = "event " + std::to_string(i % 50);
    text.Set(section, "Key" + std::to_string(i % 7), std::string(static_cast<size_t>(i % 13), 'v'));
    text.Set("History", "Count", std::to_string(i * i));
  }
  const ProfileText again(text.Get());
  EXPECT_EQ(again.SectionNames(), text.SectionNames());
  EXPECT_EQ(text.SectionNames().size(), 51U);
  for (const std::string_view section : again.SectionNames()) {
    for (int key = 0; key < 7; ++key) {
      const std::string name = "Key" + std::to_string(key);
      EXPECT_EQ(again.Find(section, name), text.Find(section, name)) << section << name;
    }
  }
  EXPECT_EQ(again.Find("History", "Count"), "39601");
}

}  // namespace
