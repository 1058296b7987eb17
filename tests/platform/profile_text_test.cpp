#include "platform/profile_text.h"

#include <gtest/gtest.h>

#include <tuple>

namespace {

TEST(ProfileText, ReadsFilesEditedByHand) {
  const ProfileText text(
      "\xEF\xBB\xBF[first]\r\nstray line\r\nKey = a b \t\v\f\r\nEmpty=\nkey=second of its name\n"
      "; Comment=1\n\n[broken\na[b]=c\n  [ x]y ] after\nSigns==a=b\n[]\n[FIRST]\nLate=1\n"
      "[last]\nQuoted = \" q\"\" \nOpen=end");
  const std::tuple<const char*, const char*, std::optional<std::string_view>> cases[] = {
      {"first", "key", "a b"},    {" First ", " KEY ", "a b"}, {"first", "Empty", ""},
      {"first", "a[b]", "c"},     {"first", "Comment", {}},    {"stray line", "Key", {}},
      {"first", "Signs", {}},     {"x]y", "Signs", "=a=b"},    {"LAST", "Open", "end"},
      {"broken", "a[b]", {}},     {"none", "Key", {}},         {"first", "Late", {}},
      {"last", "Quoted", " q\""},
  };
  for (const auto& [section, key, value] : cases) {
    EXPECT_EQ(text.Find(section, key), value) << section << ' ' << key;
  }
  EXPECT_EQ(text.SectionNames(), (std::vector<std::string_view>{"first", "x]y", "FIRST", "last"}));
}

TEST(ProfileText, ListsItsSectionsAndLines) {
  const ProfileText text(
      "before=1\n[A]\r\n Key = 'v' \r\n\n; c\nno sign\n=x\nkey=2\n[]\nk=\n[a]\n[End]\nlast = \" w");
  std::string listing;
  for (size_t i = 0; i < text.SectionCount(); ++i) {
    listing.append("[").append(text.NameOf(i)).append("]");
    for (const auto& [key, value] : text.LinesOf(i)) {
      listing.append(key).append("<").append(value).append(">");
    }
  }
  EXPECT_EQ(listing, "[A]Key<v><x>key<2>[]k<>[a][End]last<\" w>");
}

TEST(ProfileText, ChangesNothingButTheKey) {
  const char* cases[][3] = {
      {"", "v", "[S]\nK=v\n"},
      {"[s]\nk=v\n", "", "[s]\nk=\n"},
      {"[S]\r\n K = old \r\nL=1\r\n", "new", "[S]\r\n K =new\r\nL=1\r\n"},
      {"[S]\nJ=1", "v", "[S]\nJ=1\nK=v\n"},
      {"[S]", "v", "[S]\nK=v\n"},
      {"[S]\nJ=1\n\n; note\n\n[T]\nK=t\n", "v", "[S]\nJ=1\n\n; note\nK=v\n\n[T]\nK=t\n"},
      {"stray", "v", "stray\n[S]\nK=v\n"},
      {"[S\nK=1\n", "v", "[S\nK=1\n[S]\nK=v\n"},
      {"[S]\nK=1\n[S]\nK=2\n", "v", "[S]\nK=v\n[S]\nK=2\n"},
  };
  for (const auto& [before, value, after] : cases) {
    ProfileText text(before);
    text.Set("S", "K", value);
    EXPECT_EQ(text.Get(), after);
    EXPECT_EQ(text.Find("S", "K"), value);
  }
}

}  // namespace
