// Files and folders under their paths, and the classes that open files.

#include <chrono>
#include <fstream>
#include <set>
#include <tuple>

#include "platform/exclusive_file.h"
#include "platform/files.h"
#include "platform/folder_listing.h"
#include "platform/new_file.h"
#include "platform/shared_file.h"
#include "platform/temporary_file.h"
#include "tests/platform/contract.h"

namespace {

using Files = Platform;
using OpenFiles = Platform;

TEST_F(Files, HaveAKind) {
  EXPECT_TRUE(CreateFolder(In("folder")));
  for (const std::string& path : {In("folder"), Make("file"), In("none/folder"), ""s}) {
    EXPECT_FALSE(CreateFolder(path) || IsSymbolicLink(path)) << path;
  }
  EXPECT_EQ(KindOf(In("file")), FileKind::kFile);
  EXPECT_EQ(KindOf(In("folder")), FileKind::kFolder);
  for (const std::string& path : {In("none"), In("f*"), In("fil?"), In("file/x"), ""s}) {
    EXPECT_EQ(KindOf(path), FileKind::kNone) << path;
    EXPECT_FALSE(LastWriteTime(path) || FileAttributes(path)) << path;
  }
  EXPECT_TRUE(KindOf(device) != FileKind::kFile && KindOf(device) != FileKind::kFolder);
}

TEST_F(Files, AreTheSameUnderSeveralPaths) {
  const std::string file = Make("file");
  Make("other");
  Make("folder/");
  fs::create_hard_link(file, In("link"));
  for (const char* same : {"file", "folder/../file", "link", isWindows ? "FILE" : "file"}) {
    EXPECT_TRUE(IsSameFile(file, In(same))) << same;
  }
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
  fs::permissions(source, fs::perms(0444));
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

const fs::perms owners = fs::perms::owner_read | fs::perms::owner_write;

std::string Piece(const SharedFile& file, uint64_t offset, size_t size) {
  std::string bytes(size, '#');
  bytes.resize(file.ReadAt(offset, bytes.data(), size));
  return bytes;
}

std::string Next(ExclusiveFile& file, size_t size) {
  std::string bytes(size, '#');
  bytes.resize(file.Read(bytes.data(), size));
  return bytes;
}

TEST_F(OpenFiles, AreRegularFilesOnly) {
  std::error_code error;  // links are not possible everywhere
  fs::create_symlink(Make("file", "text"), In("link"), error);
  for (const std::string& path : {Make("folder/"), In("none"), In("link"), device, ""s}) {
    ExclusiveFile exclusive(path);
    EXPECT_FALSE(exclusive.IsOpen() || exclusive.Size() > 0 || !Next(exclusive, 1).empty()) << path;
    for (const LinkPolicy links : {LinkPolicy::kRefuse, LinkPolicy::kFollow}) {
      const SharedFile shared(path, links);
      const bool isText = path == In("link") && links == LinkPolicy::kFollow && !error;
      EXPECT_EQ(shared.IsOpen(), isText) << path;
      EXPECT_EQ(Piece(shared, 0, 9), isText ? "text" : "") << path;
    }
  }
}

// Up to where the file ended when it was opened.
TEST_F(OpenFiles, AreReadByOneProgramOnly) {
  const std::string bytes = "line\r\n\x1A\0"s + std::string(5000, 'b');
  const std::string path = Make("file", bytes);
  {
    ExclusiveFile file(path);
    std::ofstream(path, std::ios::app) << "more";  // impossible on Windows
    EXPECT_EQ(file.Size(), bytes.size());
    EXPECT_EQ(Next(file, 9) + Next(file, 6000), bytes);
    EXPECT_EQ(Next(file, 1), "");
    EXPECT_EQ(ExclusiveFile(path).IsOpen(), !isWindows);
  }
  EXPECT_TRUE(ExclusiveFile(path).IsOpen());
}

TEST_F(OpenFiles, AreReadAtAnyOffsetThoughTheyAreReplaced) {
  const SharedFile file(Make("a", "0123456789"), LinkPolicy::kRefuse);
  EXPECT_EQ(file.Size(), 10U);
  fs::rename(In("a"), In("b"));
  Make("a", "new");
  const std::tuple<uint64_t, size_t, const char*> cases[] = {
      {0, 10, "0123456789"},      {3, 2, "34"}, {8, 9, "89"}, {10, 1, ""}, {0, 0, ""}, {11, 1, ""},
      {uint64_t{1} << 40, 1, ""},
  };
  for (const auto& [offset, size, text] : cases) {
    EXPECT_EQ(Piece(file, offset, size), text) << offset;
  }
  EXPECT_TRUE(fs::remove(In("b")));
}

TEST_F(OpenFiles, AreRemovedUnlessNewOnesAreFinished) {
  { EXPECT_TRUE(NewFile(In("a")).Write("half")); }
  EXPECT_EQ(Tree(), "");
  NewFile finished(In("a"));
  EXPECT_TRUE(finished.Write("one") && finished.Write("") && finished.Write("\0\n"s));
  EXPECT_TRUE(finished.Finish());
  EXPECT_FALSE(finished.Finish() || finished.Write("more"));
  EXPECT_TRUE(isWindows || fs::status(In("a")).permissions() == owners);

  std::error_code error;
  fs::create_symlink(In("elsewhere"), In("link"), error);
  EXPECT_TRUE(error || !NewFile(In("link")).IsOpen());
  for (const std::string& path : {In("a"), Make("folder/"), In("none/a"), device}) {
    NewFile file(path);
    EXPECT_FALSE(file.IsOpen() || file.Write("new") || file.Finish()) << path;
  }
  EXPECT_EQ(FileText(In("a")), "one\0\n"s);
  EXPECT_FALSE(fs::exists(In("elsewhere")));
}

TEST_F(OpenFiles, HaveUniqueTemporaryNames) {
  {
    const TemporaryFile first(In("target"));
    const TemporaryFile second(In("target"));
    for (const std::string& path : {first.Path(), second.Path()}) {
      EXPECT_EQ(FolderPart(path), FolderPart(In("target")));
      EXPECT_TRUE(BaseName(path).starts_with('.'));
      EXPECT_EQ(fs::file_size(path), 0U);
      EXPECT_TRUE(isWindows || fs::status(path).permissions() == owners);
    }
    EXPECT_NE(first.Path(), second.Path());
  }
  EXPECT_EQ(Tree(), "");
  TemporaryFile none(In("none/target"));
  EXPECT_FALSE(none.Exists() || none.Replace() || none.MoveToNew());
}

TEST_F(OpenFiles, ReplaceRegularFilesOnly) {
  Make("old", "old");
  Make("folder/");
  std::error_code error;
  fs::create_symlink(In("old"), In("link"), error);
  fs::create_symlink(In("nothing"), In("dangling"), error);
  const std::string before = Tree();
  for (const std::string target : {"old", "folder", "link", "dangling"}) {
    const bool isTaken = fs::exists(fs::symlink_status(In(target)));
    TemporaryFile file(In(target));
    WriteFileText(file.Path(), "text of " + target);
    EXPECT_EQ(file.MoveToNew(), !isTaken) << target;
    EXPECT_EQ(isTaken && file.Replace(), target == "old") << target;
  }
  EXPECT_TRUE(error || Tree() == before) << Tree();
  EXPECT_EQ(FileText(In("old")), "text of old");

  for (bool (TemporaryFile::*operation)() : {&TemporaryFile::Replace, &TemporaryFile::MoveToNew}) {
    TemporaryFile file(In("new"));
    EXPECT_TRUE((file.*operation)());
    EXPECT_FALSE(file.Exists() || file.Replace() || file.MoveToNew());
    EXPECT_TRUE(fs::remove(In("new")));
  }
}

}  // namespace
