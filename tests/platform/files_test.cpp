#include "platform/files.h"

#include <chrono>
#include <ctime>
#include <set>
#include <tuple>

#include "platform/folder_listing.h"
#include "tests/platform/contract.h"

namespace {

using Files = Platform;

TEST_F(Files, HaveAKind) {
  const std::string file = Make("file", "");
  EXPECT_TRUE(CreateFolder(In("folder")));
  for (const std::string& path : {In("folder"), file, In("none/folder"), ""s}) {
    EXPECT_FALSE(CreateFolder(path) || IsSymbolicLink(path)) << path;
  }
  EXPECT_EQ(KindOf(file), FileKind::kFile);
  EXPECT_EQ(KindOf(In("folder")), FileKind::kFolder);
  for (const std::string& path : {In("none"), In("f*"), In("fil?"), In("file/x"), ""s}) {
    EXPECT_EQ(KindOf(path), FileKind::kNone) << path;
    EXPECT_FALSE(LastWriteTime(path) || FileAttributes(path)) << path;
  }
  EXPECT_TRUE(KindOf(device) != FileKind::kFile && KindOf(device) != FileKind::kFolder);
}

TEST_F(Files, AreTheSameUnderSeveralPaths) {
  const std::string file = Make("file", "x");
  Make("other", "x");
  Make("folder/");
  fs::create_hard_link(file, In("link"));
  for (const std::string& same : {file, In("folder/../file"), In("link")}) {
    EXPECT_TRUE(IsSameFile(file, same)) << same;
  }
  EXPECT_EQ(IsSameFile(file, In("FILE")), isWindows);
  EXPECT_FALSE(IsSameFile(file, In("other")) || IsSameFile(file, In("none")));
  EXPECT_FALSE(IsSameFile(In("none"), In("none")));
}

TEST_F(Files, AreMovedToAnUnusedNameOnly) {
  Make("from/sub/file");
  Make("empty/");
  Make("file", "");
  for (const char* target : {"empty", "file", "from", "./from", "none/to"}) {
    EXPECT_FALSE(MoveFolder(In("from"), In(target))) << target;
  }
  EXPECT_FALSE(MoveFolder(In("none"), In("to")) || MoveFolder(In("file"), In("to")));
  EXPECT_TRUE(MoveFolder(In("from"), In("to")));
  EXPECT_EQ(FileText(In("to/sub/file")), "from/sub/file");
  EXPECT_EQ(Tree(), "empty/\nfile\nto/\nto/sub/\nto/sub/file\n");
}

TEST_F(Files, AreCopiedToAnUnusedNameOnly) {
  const std::string text(100000, 't');
  const std::string source = Make("source", text);
  fs::last_write_time(source, fs::last_write_time(source) - std::chrono::hours(1000));
  fs::permissions(source, fs::perms::owner_read);
  Make("taken", "old");
  Make("folder/");
  EXPECT_TRUE(CopyToNewFile(source, In("copy"), /*trusted=*/Root));
  EXPECT_EQ(FileText(In("copy")), text);
  EXPECT_EQ(fs::last_write_time(In("copy")), fs::last_write_time(source));
  EXPECT_EQ(fs::status(In("copy")).permissions(), fs::status(source).permissions());
  const char* failures[][2] = {{"source", "taken"},  {"source", "source"}, {"source", "folder"},
                               {"source", "none/a"}, {"none", "new"},      {"folder", "new"}};
  for (const auto& [from, to] : failures) {
    EXPECT_FALSE(CopyToNewFile(In(from), In(to), /*trusted=*/Root)) << from << ' ' << to;
  }
  EXPECT_EQ(FileText(In("taken")), "old");
  EXPECT_EQ(Tree(), "copy\nfolder/\nsource\ntaken\n");
  fs::permissions(source, fs::perms::owner_all);  // Windows removes no file that is read-only
  fs::permissions(In("copy"), fs::perms::owner_all);
}

TEST_F(Files, AreListedWithTheirProperties) {
  Make("plain", "12345");
  fs::permissions(Make("fixed", ""), fs::perms::owner_read);
  Make(".dot", "");
  Make("folder/");
  std::set<std::string> lines;
  for (const auto& [name, size, attributes] : ListFolder(Root)) {
    EXPECT_EQ(attributes, FileAttributes(In(name))) << name;
    const bool isFolder = (attributes & kFolderAttribute) != 0;
    lines.insert(name + (isFolder ? "/" : ' ' + std::to_string(size)) +
                 ((attributes & 1) != 0 ? " read-only" : ""));
  }
  EXPECT_EQ(lines, (std::set<std::string>{"./", "../", ".dot 0", "fixed 0 read-only", "folder/",
                                          "plain 5"}));
  EXPECT_EQ(ListFolder(In("folder")).size(), 2U);
  EXPECT_TRUE(ListFolder(In("none")).empty() && ListFolder(In("plain")).empty());
  fs::permissions(In("fixed"), fs::perms::owner_all);
}

TEST_F(Files, HaveTheTimeOfTheirLastWrite) {
  const std::time_t seconds = 1'000'000'000;
  const auto time = std::chrono::system_clock::from_time_t(seconds);
  fs::last_write_time(Make("file", "x"), std::chrono::file_clock::from_sys(time));
  const CalendarTime written = LastWriteTime(In("file")).value();
  const tm* expected = std::localtime(&seconds);
  EXPECT_EQ(std::tuple(written.Year - 1900, written.Month - 1, written.Day, written.Hour,
                       written.Minute, written.Second),
            std::tuple(expected->tm_year, expected->tm_mon, expected->tm_mday, expected->tm_hour,
                       expected->tm_min, expected->tm_sec));
  EXPECT_GT(LastWriteTime(Root).value().Year, 2001);
}

}  // namespace
