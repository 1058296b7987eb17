// Profile files and their text.

#include <algorithm>
#include <functional>
#include <sstream>
#include <tuple>

#include "platform/profile_text.h"
#include "tests/platform/contract.h"

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
  std::string listing;
  for (size_t i = 0; i < text.SectionCount(); ++i) {
    listing.append("[").append(text.NameOf(i)).append("]");
    for (const auto& [key, value] : text.LinesOf(i)) {
      listing.append(key).append("<").append(value).append(">");
    }
  }
  EXPECT_EQ(listing,
            "[first]Key<a b>Empty<>key<second of its name>; Comment<1>a[b]<c>[x]y]Signs<=a=b>[]"
            "[FIRST]Late<1>[last]Quoted< q\">Open<end>");
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

// Writes each value of the list, and returns what is read after each one, in the form of the list.
std::string ReadEach(const std::string& ini, const std::string& values,
                     const std::function<std::string()>& read) {
  std::istringstream stream(values);
  std::string text;
  for (std::string value; std::getline(stream, value, '|');) {
    EXPECT_TRUE(WriteProfileValue(ini, "S", "Key", value)) << value;
    text += read() + '|';
  }
  return text;
}

TEST_F(ProfileFile, CutsValuesToTheSizeOfTheBuffer) {
  EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", "0123456789"));
  for (const uint32_t size : {0U, 1U, 2U, 10U, 11U, 12U, 256U}) {
    const std::string expected = "0123456789"s.substr(0, std::max(size, 1U) - 1);
    EXPECT_EQ(ReadProfileValue(Ini, "S", "Key", "", size), expected) << size;
    EXPECT_EQ(ReadProfileValue(Ini, "S", "None", "0123456789", size), expected) << size;
    EXPECT_EQ(ReadProfileValue(In("none"), "S", "Key", "0123456789", size), expected) << size;
  }
  EXPECT_EQ(Tree(), "a.ini\n");
}

TEST_F(ProfileFile, RemovesBlanksAndOnePairOfQuotes) {
  EXPECT_EQ(
      ReadEach(Ini, R"("a"|'a'|""a""|" a "|"a|a"|"a'|"a" "b"|"|""|  a b  | "a" |a=b;c|[x]||  |)",
               [this] { return Value(); }),
      R"(a|a|"a"| a |"a|a"|"a'|a" "b|"||a b|a|a=b;c|[x]|||)");
}

TEST_F(ProfileFile, ReadsANumberAsFarAsItGoes) {
  const auto readNumber = [this] { return std::to_string(ReadProfileInt(Ini, "S", "Key", 5)); };
  EXPECT_EQ(
      ReadEach(Ini, R"(12|-12|0|12abc|abc|-| 7 |007|"12"|2147483647||""|+5|+|+-5|- 5|" 7"|1 2|)",
               readNumber),
      "12|-12|0|12|0|0|7|7|12|2147483647|5|5|5|0|0|0|7|1|");
  EXPECT_EQ(
      ReadEach(Ini, "0x10|-0xfG|0XF|0x|0o17|0b11|2147483648|4294967297|99999999999|", readNumber),
      "16|-15|0|0|15|3|-2147483648|1|1215752191|");
  EXPECT_EQ(ReadProfileInt(Ini, "S", "None", -5), -5);
  EXPECT_EQ(ReadProfileInt(In("none"), "S", "Key", 5), 5);
}

TEST_F(ProfileFile, KeepsOrderAndCase) {
  const char* const writes[][3] = {{"One", "B", "1"}, {"Two", "K", "2"},  {"One", "A", "3"},
                                   {"ONE", "b", "4"}, {"two", "New", ""}, {"Two", "K", ""}};
  for (const auto& [section, key, value] : writes) {
    EXPECT_TRUE(WriteProfileValue(Ini, section, key, value));
  }
  // Line ends are the system's, which may also set a blank line between sections.
  const std::string text = Replaced(Neutral(FileText(Ini)), "\n\n", "\n");
  EXPECT_EQ(text, "[S]\nKey=old\n[One]\nB=4\nA=3\n[Two]\nK=\nNew=\n");
  EXPECT_EQ(ReadProfileValue(Ini, "TWO", "new", "none", 256), "");
  EXPECT_EQ(ReadProfileValue(Ini, "oNE", "a", "none", 256), "3");
}

TEST_F(ProfileFile, FailsWhereNoFileCanBeCreated) {
  Make("folder/");
  EXPECT_FALSE(WriteProfileValue(In("folder"), "S", "Key", "v"));
  EXPECT_FALSE(WriteProfileValue(In("none/a.ini"), "S", "Key", "v"));
  EXPECT_EQ(ReadProfileValue(In("folder"), "S", "Key", "none", 256), "none");
  EXPECT_EQ(Tree(), "a.ini\nfolder/\n");
}

TEST_F(ProfileFile, IsReplacedOnceWhenTheOutermostGuardEnds) {
  const std::string before = "[S]\nKey=old\n";
  const std::string other = Make("other/b.ini", before);
  const auto read = [this, &other] {
    return Value() + Value("More") + ReadProfileValue(other, "S", "Key", "none", 256);
  };
  {
    const ProfileGuard guard(Ini);
    {
      const ProfileGuard inner(Ini);
      EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", "a"));
      EXPECT_TRUE(WriteProfileValue(Ini, "S", "More", "m"));
    }
    EXPECT_EQ(read(), "amold");
    const ProfileGuard ofOther(other);
    EXPECT_TRUE(WriteProfileValue(other, "S", "Key", "new"));
    EXPECT_TRUE(WriteProfileValue(In("c.ini"), "S", "Key", "c"));
    EXPECT_EQ(read(), "amnew");
    EXPECT_EQ(FileText(Ini) + FileText(other) + FileText(In("c.ini")), before + before);
  }
  EXPECT_EQ(read(), "amnew");
  EXPECT_EQ(ReadProfileValue(In("c.ini"), "S", "Key", "none", 256), "c");
  EXPECT_EQ(Tree(), "a.ini\nc.ini\nother/\nother/b.ini\n");
}

// A count that could not be read is taken for 0, which must not be written back.
TEST_F(ProfileFile, IsNotWrittenAfterAReadThatFailed) {
  fs::remove(Ini);
  fs::create_directory(Ini);
  {
    const ProfileGuard guard(Ini);
    EXPECT_EQ(ReadProfileInt(Ini, "S", "Count", 0), 0);
    fs::remove(Ini);
    Make("a.ini", "[S]\nCount=5\n");
    EXPECT_FALSE(WriteProfileValue(Ini, "S", "Count", "1"));
  }
  EXPECT_EQ(ReadProfileInt(Ini, "S", "Count", 0), 5);
  EXPECT_TRUE(WriteProfileValue(Ini, "S", "Count", "6"));
}

}  // namespace
