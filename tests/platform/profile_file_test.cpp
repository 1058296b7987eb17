#include "platform/profile_file.h"

#include <algorithm>
#include <functional>
#include <regex>
#include <sstream>

#include "tests/platform/contract.h"

namespace {

class ProfileFile : public Platform {
 protected:
  // Writes each value of the list, and returns what is read after each one, in the form of the
  // list.
  std::string ReadEach(const std::string& values, const std::function<std::string()>& read) const {
    std::istringstream stream(values);
    std::string text;
    for (std::string value; std::getline(stream, value, '|');) {
      EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", value)) << value;
      text += read() + '|';
    }
    return text;
  }

  const std::string Ini = In("a.ini");
};

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
  const auto readText = [this] { return ReadProfileValue(Ini, "S", "Key", "none", 256); };
  EXPECT_EQ(ReadEach(R"("a"|'a'|""a""|" a "|"a|a"|"a'|"a" "b"|"|""|  a b  | "a" |a=b;c|[x]||  |)",
                     readText),
            R"(a|a|"a"| a |"a|a"|"a'|a" "b|"||a b|a|a=b;c|[x]|||)");
  const auto readNumber = [this] { return std::to_string(ReadProfileInt(Ini, "S", "Key", 5)); };
  EXPECT_EQ(ReadEach(R"(12|-12|0|12abc|abc|-| 7 |007|"12"|2147483647||""|+5|+|+-5|- 5|" 7"|1 2|)",
                     readNumber),
            "12|-12|0|12|0|0|7|7|12|2147483647|5|5|5|0|0|0|7|1|");
  EXPECT_EQ(ReadEach("0x10|-0xfG|0XF|0x|0o17|0b11|2147483648|4294967297|99999999999|", readNumber),
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
  const std::string text = std::regex_replace(FileText(Ini), std::regex("[\r\n]+"), "\n");
  EXPECT_EQ(text, "[One]\nB=4\nA=3\n[Two]\nK=\nNew=\n");
  EXPECT_EQ(ReadProfileValue(Ini, "TWO", "new", "none", 256), "");
  EXPECT_EQ(ReadProfileValue(Ini, "oNE", "a", "none", 256), "3");
}

TEST_F(ProfileFile, ListsSectionsAsFarAsTheyFit) {
  const auto upToEnd = [](const std::string& names) {
    return names.substr(0, names.find("\0\0"s));
  };
  EXPECT_EQ(ReadProfileSectionNames(Ini, 100).substr(0, 2), "\0\0"s);
  Make("a.ini", "[ab]\n[cde]\n");
  for (const uint32_t size : {0, 1, 2, 3, 5, 6, 7, 8, 9, 100}) {
    const std::string names = ReadProfileSectionNames(Ini, size);
    const uint32_t counted = std::max(size, 2U);
    EXPECT_LE(names.size(), counted);
    EXPECT_EQ(upToEnd(names), upToEnd("ab\0cde"s.substr(0, counted - 2) + "\0\0"s)) << size;
  }
}

TEST_F(ProfileFile, FailsWhereNoFileCanBeCreated) {
  Make("folder/");
  EXPECT_FALSE(WriteProfileValue(In("folder"), "S", "Key", "v"));
  EXPECT_FALSE(WriteProfileValue(In("none/a.ini"), "S", "Key", "v"));
  EXPECT_EQ(ReadProfileValue(In("folder"), "S", "Key", "none", 256), "none");
  EXPECT_EQ(Tree(), "folder/\n");
}

TEST_F(ProfileFile, IsReplacedOnceWhenTheOutermostGuardEnds) {
  const std::string before = "[S]\nKey=b\n";
  Make("a.ini", before);
  const std::string other = Make("other/b.ini", before);
  const auto read = [this, &other] {
    return ReadProfileValue(Ini, "S", "Key", "none", 256) +
           ReadProfileValue(Ini, "T", "Key", "none", 256) +
           ReadProfileValue(other, "S", "Key", "none", 256);
  };
  {
    const ProfileGuard guard(Ini);
    {
      const ProfileGuard inner(Ini);
      EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", "a"));
      EXPECT_TRUE(WriteProfileValue(Ini, "T", "Key", "t"));
    }
    EXPECT_EQ(read(), "atb");
    const ProfileGuard ofOther(other);
    EXPECT_TRUE(WriteProfileValue(other, "S", "Key", "new"));
    EXPECT_TRUE(WriteProfileValue(In("c.ini"), "S", "Key", "c"));
    EXPECT_EQ(read(), "atnew");
    EXPECT_EQ(FileText(Ini) + FileText(other) + FileText(In("c.ini")), before + before);
  }
  EXPECT_EQ(read(), "atnew");
  EXPECT_EQ(ReadProfileValue(In("c.ini"), "S", "Key", "none", 256), "c");
  EXPECT_EQ(Tree(), "a.ini\nc.ini\nother/\nother/b.ini\n");
}

// A count that could not be read is taken for 0, which must not be written back.
TEST_F(ProfileFile, IsNotWrittenAfterAReadThatFailed) {
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
