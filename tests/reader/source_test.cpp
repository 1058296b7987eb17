#include "reader/source.h"

#include <gtest/gtest.h>

#include <tuple>

#include "tests/reader/archive_builder.h"
#include "tests/support/scratch_folder.h"

namespace {

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
  return Content(OpenArchive({archive.size(), ReaderOf(archive)}, error), error);
}

constexpr uint32_t folder = 0x10;
constexpr uint32_t link = 0xA1FFU << 16;
const std::string ini = "History.ini";

// What it shows, the entries of an archive, and its content.
using Case = std::tuple<const char*, std::vector<BuiltEntry>, std::string>;

// The entries follow a history file, and their content that of the file.
void CheckBesideHistory(const std::vector<Case>& cases) {
  for (auto [what, entries, content] : cases) {
    entries.insert(entries.begin(), {ini, "i"});
    EXPECT_EQ(ContentOf(BuildArchive(entries)), "History.ini=i" + content) << what;
  }
}

TEST(Source, ReadsArchivesOfEveryMaker) {
  CheckBesideHistory({
      {"Linux", {{"A", "", folder}, {"A/42", "", folder}, {"A/42/r", "x"}}, " A/42/r=x"},
      {"Windows", {{"A", "", folder}, {"A\\42", "", folder}, {"A\\42\\r", "x"}}, " A/42/r=x"},
      {"Windows, a backslash in a character",
       {{"\x95\\", "", folder}, {"\x95\\\\\x83\\b", "x"}},
       " \x95\\/\x83\\b=x"},
      {"Windows, a letter before the separator",
       {{"K\xE4", "", folder}, {"K\xE4\\r", "x"}},
       " K\xE4/r=x"},
      {"Linux, a backslash in a name", {{"a\\b/r", "x"}}, " a\\b/r=x"},
      {"another tool", {{"A/", ""}, {"A/r", "x", 0, 0, 8}}, " A/r=x"},
      {"another tool on Windows", {{"A\\", ""}, {"A\\r", "x"}}, " A/r=x"},
      {"hidden", {{".a/b", "x"}, {"a/.b", "x"}}, ""},
  });
}

TEST(Source, LeavesOutWhatIsHostile) {
  const std::string refused =
      " ! Entries left out, as their names lead out of the archive's folder, are no names, or are "
      "there twice: 1.";
  CheckBesideHistory({
      {"up", {{"../a", "x"}}, refused},
      {"up, in the middle", {{"a/../../b", "x"}}, refused},
      {"up, on Windows", {{"..\\a", "x"}}, refused},
      {"rooted", {{"/etc/a", "x"}}, refused},
      {"an empty name", {{"", "x"}}, refused},
      {"a NUL", {{std::string("a\0b", 3), "x"}}, refused},
      {"twice", {{ini, "other"}}, refused},
      {"a link", {{"a", "/etc/passwd", link}}, ""},
      {"a long name",
       {{std::string(5000, 'a'), "x"}},
       " ! Entries left out, as their names have more than 4096 bytes: 1."},
      {"encrypted",
       {{"a", "x", 0, 1}},
       " a=? ! a is encrypted; ask for an archive without a password."},
      {"an unknown method",
       {{"a", "x", 0, 0, 12}},
       " a=? ! a is packed with method 12, which is not known here."},
      {"too short", {{"a", "text", 0, 0, 8, 5}}, " a=? ! a is damaged."},
      {"too long", {{"a", "text", 0, 0, 8, -2}}, " a=? ! a is damaged."},
      {"too large", {{"a", "x", 0, 0, 0, 1 << 30}}, " a=? ! a has more than 16 MiB."},
  });
}

TEST(Source, FindsTheHistoryOrSaysWhatIsWrong) {
  const std::pair<std::string, std::string> cases[] = {
      {BuildArchive({{"x/A/r", "x"}, {"x/HISTORY.INI", "i"}, {"y/z", "no"}}),
       "A/r=x HISTORY.INI=i"},
      {BuildArchive({{"d/History.ini", "no"}, {"ZEK/ORXHistory/History.ini", "i"}}),
       "History.ini=i ! More than one history is here; the one in ZEK/ORXHistory/ is read."},
      {BuildArchive({{"d/History.ini", "i"}, {"e/History.ini", "no"}}),
       "History.ini=i ! More than one history is here; the one in d/ is read."},
      {BuildArchive({{"ZEK/ORXHistory/A/42/ORXInstallEvent.Log", "r"}, {"x", ""}}),
       "A/42/ORXInstallEvent.Log=r"},
      {BuildArchive({{"a", "x"}}), "error: holds no history; name an archive that the report made"},
      {BuildArchive({}), "error: is an empty archive; name one that holds a history"},
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

TEST(Source, ReadsNoMoreThanTheLimits) {
  std::vector<BuiltEntry> large = {{ini, "i"}};
  while (large.size() < 80) {
    large.push_back({std::to_string(large.size()), "x", 0, 0, 0, 15 << 20});
  }
  const std::string content = ContentOf(BuildArchive(large));
  EXPECT_NE(
      content.find("! 68 is damaged. ! 69 is beyond the first 1024 MiB of what is read. ! 70"),
      content.npos)
      << content;

  std::vector<BuiltEntry> many = {{ini, "i"}};
  while (many.size() < 2100) {
    many.push_back({std::to_string(many.size()), ""});
    many.back().Name.resize(4096, 'n');
  }
  // The last one of these exceeds 8 MiB.
  EXPECT_TRUE(
      ContentOf(BuildArchive(many))
          .ends_with("! The archive holds more than 2049 entries; the others are left out."));
}

TEST(Source, FindsTheHistoryBelowAFolder) {
  const ScratchFolder scratch;
  scratch.Make("top/data/ZEK/ORXHistory/A/42/r", "x");
  scratch.Make("top/data/ZEK/ORXHistory/.tmp", "no");
  scratch.Make("top/data/ZEK/ORXHistory/History.ini", "i");
  scratch.Make("empty/");
  const std::string content = "History.ini=i A/42/r=x";
  const std::pair<const char*, std::string> cases[] = {
      {"top", content},
      {"top/data", content},
      {"top/data/ZEK/ORXHistory", content},
      {"top/data/ZEK/", content},
      {"empty", "error: @/empty holds no history; name an archive or the folder of a history."},
      {"none", "error: @/none is not there; name an archive or a folder."}};
  for (const auto& [path, found] : cases) {
    std::string error;
    EXPECT_EQ(scratch.Neutral(Content(OpenSource(scratch.In(path), error), error)), found);
  }
}

}  // namespace
