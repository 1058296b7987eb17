// Paths and texts in the code pages of Windows. Under Wine these run with several of them.

#include "platform/path.h"

#include "platform/text_codec.h"
#include "tests/platform/contract.h"

namespace {

// One character in the Japanese code page, whose second byte equals a backslash; elsewhere two
// characters, of which the second one is a separator on Windows.
const std::string hyou = "\x95\x5C";
const bool isOneCharacter = IsLeadByte(hyou[0]) || !isWindows;

const std::string root = isWindows ? "C:\\" : "/";

std::string Native(const std::string& path) { return Replaced(path, "/", {kPathSeparator}); }

TEST(Path, IsSplitAtItsLastSeparator) {
  const std::string cases[][3] = {{"", "", ""},         {"a", "", "a"}, {"a/b", "a/", "b"},
                                  {"a/b/", "a/b/", ""}, {"/", "/", ""}, {"a//b", "a//", "b"}};
  for (const auto& [path, folder, name] : cases) {
    EXPECT_EQ(FolderPart(Native(path)), Native(folder)) << path;
    EXPECT_EQ(BaseName(Native(path)), Native(name)) << path;
    EXPECT_EQ(JoinPath(Native(folder), Native(name)), Native(path)) << path;
  }
}

TEST(Path, IsNotSplitInsideACharacter) {
  const std::string name = "a" + hyou + ".log";
  const std::string path = JoinPath(hyou, name);
  EXPECT_EQ(path, isOneCharacter ? hyou + kPathSeparator + name : hyou + name);
  EXPECT_EQ(BaseName(path), isOneCharacter ? name : ".log");
  EXPECT_EQ(FolderPart(path) + BaseName(path), path);
  EXPECT_EQ(EndsWithSeparator(hyou), !isOneCharacter);
  EXPECT_TRUE(EndsWithSeparator(hyou + kPathSeparator));
  EXPECT_EQ(FindSeparator(path), isOneCharacter ? 2U : 1U);
}

TEST(Path, HasNamesThatTheSystemChanges) {
  for (const char* name : {"", ".", "..", "42", "a b", ".a", "a.b", "CONSOLE", "COM", "COM12",
                           "LPTx", "aux1", "NULL.txt", "a[1]=b;c"}) {
    EXPECT_TRUE(IsKeptName(name)) << name;
  }
  for (const char* name :
       {"a.",      "a ",     "a. .", "...",      ". ",   " ",      "CON",     "nul",
        "aux.txt", "Prn .a", "COM1", "lpt9.log", "COM0", "conin$", "CONOUT$", "a:b",
        "a*",      "a?",     "a<b",  "a>b",      "a\"b", "a|b",    "a\tb"}) {
    EXPECT_EQ(IsKeptName(name), !isWindows) << name;
  }
}

TEST(Path, HasALimit) {
  const size_t longest = isWindows ? 259 : 4095;
  EXPECT_TRUE(FitsPathLimit(root + std::string(longest - root.size(), 'x')));
  EXPECT_FALSE(FitsPathLimit(root + std::string(longest + 1 - root.size(), 'x')));
}

TEST(Path, IsMadeAbsolute) {
  const std::string here = fs::current_path().string();
  EXPECT_TRUE(IsRootedPath(here));
  EXPECT_FALSE(IsRootedPath("a"));
  EXPECT_EQ(AbsolutePath("a"), here + kPathSeparator + "a");
  EXPECT_EQ(AbsolutePath(""), std::nullopt);
  // The longest path that a buffer of 260 bytes holds; POSIX has no such limit.
  const std::string longest = root + std::string(259 - root.size(), 'x');
  EXPECT_EQ(AbsolutePath(longest), longest);
  EXPECT_EQ(AbsolutePath(longest + 'x').has_value(), !isWindows);
}

TEST(TextCodec, ReadsTheSameEncodingsOnBothSystems) {
  const char* cases[][3] = {
      {"CP1252", "\x80 \xFC", "\u20AC \u00FC"},
      {"cp932", "\x95\x5C\\a", "\u8868\\a"},
      {"windows-1250", "\xB9\xB9", "\u0105\u0105"},
      {"ISO-8859-1", "\xFC", "\u00FC"},
      {"iso-8859-15", "\xA4", "\u20AC"},
      {"CP850", "\x81", "\u00FC"},
      {"CP1252", "", ""},
  };
  for (const auto& [encoding, raw, text] : cases) {
    const std::optional<TextCodec> codec = TextCodec::Open(encoding);
    ASSERT_TRUE(codec) << encoding;
    EXPECT_EQ(codec->ToUtf8(raw), text) << encoding;
  }
  for (const char* name : {"", "none", "CP", "CP1252x", "CP99999", "windows-", "-1252"}) {
    EXPECT_FALSE(TextCodec::Open(name)) << name;
  }
}

TEST(TextCodec, ContinuesAfterInvalidBytes) {
  // Half a character at the end, and before a blank.
  const std::optional<TextCodec> codec = TextCodec::Open("CP932");
  ASSERT_TRUE(codec);
  const std::string text = codec->ToUtf8("a\x95");
  EXPECT_TRUE(text.starts_with("a") && text.size() > 1) << text;
  EXPECT_NE(codec->ToUtf8("\xFD z").find(" z"), std::string::npos);
  EXPECT_EQ(codec->ToUtf8("b"), "b");
}

}  // namespace
