#include "platform/files.h"

#include <chrono>
#include <ctime>
#include <numeric>
#include <set>
#include <tuple>

#include "platform/folder_listing.h"
#include "tests/platform/contract.h"

namespace {

using Files = Platform;

// The names in a folder, sorted, each followed by a blank.
std::string Names(const std::string& folder) {
  std::set<std::string> names;
  for (const FolderEntry& entry : ListFolder(folder)) {
    names.insert(entry.Name == "." || entry.Name == ".." ? "" : entry.Name + ' ');
  }
  return std::accumulate(names.begin(), names.end(), ""s);
}

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
  Make("from/sub/file", "text");
  Make("empty/");
  Make("file", "");
  for (const std::string& target :
       {In("empty"), In("file"), In("from"), In("./from"), In("none/to")}) {
    EXPECT_FALSE(MoveFolder(In("from"), target)) << target;
    EXPECT_EQ(FileText(In("from/sub/file")), "text");
  }
  EXPECT_FALSE(MoveFolder(In("none"), In("to")) || MoveFolder(In("file"), In("to")));
  EXPECT_TRUE(MoveFolder(In("from"), In("to")));
  EXPECT_EQ(FileText(In("to/sub/file")), "text");
  EXPECT_EQ(Tree(), "empty/\nfile\nto/\nto/sub/\nto/sub/file\n");
}

TEST_F(Files, AreCopiedToAnUnusedNameOnly) {
  const std::string text(100000, 't');
  const std::string source = Make("source", text);
  fs::last_write_time(source, fs::last_write_time(source) - std::chrono::hours(1000));
  fs::permissions(source, fs::perms::owner_read);
  const std::string taken = Make("taken", "old");
  Make("folder/");
  EXPECT_TRUE(CopyToNewFile(source, In("copy"), /*trusted=*/Root));
  EXPECT_EQ(FileText(In("copy")), text);
  EXPECT_EQ(fs::last_write_time(In("copy")), fs::last_write_time(source));
  EXPECT_EQ(fs::status(In("copy")).permissions(), fs::status(source).permissions());
  for (const std::string& target : {taken, source, In("folder"), In("none/copy")}) {
    EXPECT_FALSE(CopyToNewFile(source, target, /*trusted=*/Root)) << target;
  }
  for (const char* noFile : {"none", "folder"}) {
    EXPECT_FALSE(CopyToNewFile(In(noFile), In("new"), /*trusted=*/Root)) << noFile;
  }
  EXPECT_EQ(FileText(taken), "old");
  EXPECT_EQ(Tree(), "copy\nfolder/\nsource\ntaken\n");
  fs::permissions(source, fs::perms::owner_all);  // Windows removes no file that is read-only
  fs::permissions(In("copy"), fs::perms::owner_all);
}

TEST_F(Files, AreListedWithTheirProperties) {
  Make("plain", "12345");
  fs::permissions(Make("fixed", ""), fs::perms::owner_read);
  Make(".dot", "");
  Make("folder/");
  constexpr uint32_t readOnly = 1;
  for (const auto& [name, size, attributes] : ListFolder(Root)) {
    EXPECT_EQ(attributes, FileAttributes(In(name))) << name;
    const bool isFolder = name == "folder" || name == "." || name == "..";
    EXPECT_EQ((attributes & kFolderAttribute) != 0, isFolder) << name;
    EXPECT_EQ((attributes & readOnly) != 0, name == "fixed") << name;
    EXPECT_TRUE(isFolder || size == (name == "plain" ? 5 : 0)) << name;
  }
  EXPECT_EQ(Names(Root), ".dot fixed folder plain ");
  EXPECT_EQ(Names(In("folder")), "");
  EXPECT_TRUE(ListFolder(In("none")).empty() && ListFolder(In("plain")).empty());
  fs::permissions(In("fixed"), fs::perms::owner_all);
}

TEST_F(Files, HaveTheTimeOfTheirLastWrite) {
  const std::time_t before = std::time(nullptr);
  Make("file", "x");
  Make("folder/");
  for (const char* name : {"file", "folder"}) {
    const CalendarTime time = LastWriteTime(In(name)).value();
    tm fields = {};
    std::tie(fields.tm_year, fields.tm_mon, fields.tm_mday, fields.tm_hour, fields.tm_min,
             fields.tm_sec, fields.tm_isdst) =
        std::tuple(time.Year - 1900, time.Month - 1, time.Day, time.Hour, time.Minute, time.Second,
                   -1);
    EXPECT_NEAR(std::difftime(std::mktime(&fields), before), 0, 5);
  }
}

}  // namespace
