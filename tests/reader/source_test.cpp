#include "reader/source.h"

#include <gtest/gtest.h>

#include <tuple>

#include "tests/reader/archive_builder.h"
#include "tests/support/scratch_folder.h"

namespace {

ArchiveBytes BytesOf(const std::string& bytes) {
  return {bytes.size(), [bytes](uint64_t offset, char* buffer, size_t size) {
            return offset < bytes.size() ? bytes.copy(buffer, size, offset) : 0;
          }};
}

// The paths and texts of the files, then the findings; or the error.
std::string Content(const std::unique_ptr<Source>& source, const std::string& error) {
  if (!source) {
    return "error: " + error;
  }
  std::string content;
  for (size_t i = 0; i < source->Files.size(); ++i) {
    content += source->Files[i].Path + "=" + source->Read(i).value_or("?") + " ";
  }
  for (const Finding& finding : source->Findings) {
    content += "! " + finding.Text + " ";
  }
  content.resize(content.size() - (content.empty() ? 0 : 1));
  return content;
}

std::string ContentOf(const std::string& archive) {
  std::string error;
  const std::unique_ptr<Source> source = OpenArchive(BytesOf(archive), error);
  return Content(source, error);
}

constexpr uint32_t folder = 0x10;
constexpr uint32_t link = 0xA1FFU << 16;
const std::string ini = "History.ini";
const std::string report = "ORXInstallEvent.Log";

// What it shows, the entries of an archive, and its content.
using Case = std::tuple<const char*, std::vector<BuiltEntry>, std::string>;

TEST(Source, ReadsArchivesOfEveryMaker) {
  const Case cases[] = {
      {"Linux",
       {{"A", "", folder}, {"A/42", "", folder}, {"A/42/r", "x"}, {ini, "i"}},
       "A/42/r=x History.ini=i"},
      {"Windows",
       {{"A", "", folder}, {"A\\42", "", folder}, {"A\\42\\r", "x"}, {ini, "i"}},
       "A/42/r=x History.ini=i"},
      {"Windows, a backslash in a character",
       {{"\x95\\", "", folder}, {"\x95\\\\\x83\\b", "x"}, {ini, "i"}},
       "\x95\\/\x83\\b=x History.ini=i"},
      {"Windows, a letter before the separator",
       {{"K\xE4", "", folder}, {"K\xE4\\r", "x"}, {ini, "i"}},
       "K\xE4/r=x History.ini=i"},
      {"Linux, a backslash in a name", {{"a\\b/r", "x"}, {ini, "i"}}, "a\\b/r=x History.ini=i"},
      {"another tool", {{"A/", ""}, {"A/r", "x", 0, 0, 8}, {ini, "i"}}, "A/r=x History.ini=i"},
      {"another tool on Windows", {{"A\\", ""}, {"A\\r", "x"}, {ini, "i"}}, "A/r=x History.ini=i"},
      {"a folder around it",
       {{"x/A/r", "x"}, {"x/HISTORY.INI", "i"}, {"y/z", "no"}},
       "A/r=x HISTORY.INI=i"},
      {"the whole tree",
       {{"d/History.ini", "no"}, {"ZEK/ORXHistory/History.ini", "i"}},
       "History.ini=i ! More than one history is here; the one in ZEK/ORXHistory/ is read."},
      {"no history file",
       {{"ZEK/ORXHistory/A/42/" + report, "r"}, {"x", ""}},
       "A/42/" + report + "=r"},
      {"hidden", {{".a/b", "x"}, {"a/.b", "x"}, {ini, "i"}}, "History.ini=i"},
  };
  for (const auto& [maker, entries, content] : cases) {
    EXPECT_EQ(ContentOf(BuildArchive(entries)), content) << maker;
  }
}

TEST(Source, LeavesOutWhatIsHostile) {
  const BuiltEntry good = {ini, "i"};
  const std::string refused =
      "History.ini=i ! Entries left out, as their names lead out of the archive's folder, are no "
      "names, or are there twice: 1.";
  const Case cases[] = {
      {"up", {{"../a", "x"}, good}, refused},
      {"up, in the middle", {{"a/../../b", "x"}, good}, refused},
      {"up, on Windows", {{"..\\a", "x"}, good}, refused},
      {"rooted", {{"/etc/a", "x"}, good}, refused},
      {"an empty name", {{"", "x"}, good}, refused},
      {"a NUL", {{std::string("a\0b", 3), "x"}, good}, refused},
      {"twice", {good, {ini, "other"}}, refused},
      {"a link", {{"a", "/etc/passwd", link}, good}, "History.ini=i"},
      {"a long name",
       {{std::string(5000, 'a'), "x"}, good},
       "History.ini=i ! Entries left out, as their names have more than 4096 bytes: 1."},
      {"encrypted",
       {{ini, "i", 0, 1}},
       "History.ini=? ! History.ini is encrypted; ask for an archive without a password."},
      {"an unknown method",
       {{ini, "i", 0, 0, 12}},
       "History.ini=? ! History.ini is packed with method 12, which is not known here."},
      {"too short", {{ini, "text", 0, 0, 8, 5}}, "History.ini=? ! History.ini is damaged."},
      {"too long", {{ini, "text", 0, 0, 8, -2}}, "History.ini=? ! History.ini is damaged."},
      {"too large",
       {{ini, "i", 0, 0, 0, 1 << 30}},
       "History.ini=? ! History.ini has more than 16 MiB."},
      {"no history", {{"a", "x"}}, "error: holds no history; name an archive that the report made"},
      {"nothing", {}, "error: is an empty archive; name one that holds a history"},
  };
  for (const auto& [what, entries, content] : cases) {
    EXPECT_EQ(ContentOf(BuildArchive(entries)), content) << what;
  }
}

TEST(Source, SaysWhatIsNoArchive) {
  const std::pair<std::string, const char*> cases[] = {
      {"", "error: is empty; copy the archive again"},
      {"text", "error: is neither a zip archive nor a folder; name one that holds a history"},
      {BuildArchive({{ini, "i"}}, 3),
       "History.ini=i ! The archive's directory is damaged after 1 of 4 entries."},
      {Replaced(BuildArchive({{ini, "text"}}), "text", "next"),
       "History.ini=? ! History.ini is damaged."}};
  for (const auto& [bytes, content] : cases) {
    EXPECT_EQ(ContentOf(bytes), content);
  }
}

TEST(Source, ReadsNoArchiveThatIsCut) {
  const std::string whole = BuildArchive({{"A/r", std::string(999, 'x'), 0, 0, 8}, {ini, "i"}});
  constexpr size_t endRecord = 22;  // an archive that lacks some bytes of it may still be read
  for (size_t size = 4; size <= whole.size() - endRecord; ++size) {
    const std::string content = ContentOf(whole.substr(0, size));
    EXPECT_TRUE(content.starts_with("error: is cut off")) << size << content;
  }
}

TEST(Source, ReadsNoMoreThanTheLimit) {
  std::vector<BuiltEntry> entries(80, {"", "x", 0, 0, 0, 15 << 20});
  for (size_t i = 0; i < entries.size(); ++i) {
    entries[i].Name = i == 0 ? ini : std::to_string(i);
  }
  const std::string content = ContentOf(BuildArchive(entries));
  EXPECT_NE(
      content.find("! 67 is damaged. ! 68 is beyond the first 1024 MiB of what is read. ! 69"),
      std::string::npos)
      << content;
}

TEST(Source, ReadsNoMoreNamesThanTheLimit) {
  std::vector<BuiltEntry> entries(2100, {"", ""});
  for (size_t i = 0; i < entries.size(); ++i) {
    const std::string number = std::to_string(i);
    entries[i].Name = i == 0 ? ini : number + std::string(4096 - number.size(), 'n');
  }
  // The last one of these exceeds 8 MiB.
  EXPECT_TRUE(
      ContentOf(BuildArchive(entries))
          .ends_with("! The archive holds more than 2049 entries; the others are left out."));
}

class FolderSource : public testing::Test, protected ScratchFolder {};

TEST_F(FolderSource, FindsTheHistoryBelow) {
  Make("top/data/ZEK/ORXHistory/A/42/r", "x");
  Make("top/data/ZEK/ORXHistory/.tmp", "no");
  Make("top/data/ZEK/ORXHistory/History.ini", "i");
  for (const char* path : {"top", "top/data", "top/data/ZEK/ORXHistory", "top/data/ZEK/"}) {
    std::string error;
    const std::unique_ptr<Source> source = OpenSource(In(path), error);
    EXPECT_EQ(Content(source, error), "History.ini=i A/42/r=x") << path;
  }
  std::string error;
  EXPECT_EQ(OpenSource(Make("empty/"), error), nullptr);
  EXPECT_TRUE(error.ends_with("holds no history; name an archive or the folder of a history."))
      << error;
  EXPECT_EQ(OpenSource(In("none"), error), nullptr);
  EXPECT_TRUE(error.ends_with("none is not there; name an archive or a folder.")) << error;
}

}  // namespace
