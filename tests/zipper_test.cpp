#include "report/zipper.h"

#include <gtest/gtest.h>

#include <ctime>
#include <filesystem>
#include <string>

#include "history/locations.h"
#include "platform/path.h"
#include "report/zip_names.h"
#include "tests/archive_reader.h"
#include "tests/fake_machine.h"

namespace {

namespace fs = std::filesystem;
using Names = std::vector<std::string>;

// The path with the platform's separators in place of its slashes.
std::string Native(std::string path) {
  std::replace(path.begin(), path.end(), '/', kPathSeparator);
  return path;
}

// A tree in the folder "Tree" to pack, and an archive beside it.
class Zipper : public testing::Test {
 protected:
  void SetUp() override {
    fs::create_directories(In("Tree/sub/empty"));
    fs::create_directories(In("Tree/.hidden"));
    WriteFileText(In("Tree/a.txt"), "a");
    WriteFileText(In("a.txt"), "outside");
    WriteFileText(In("Tree/sub/b.txt"), "bb");
    WriteFileText(In("Tree/.hidden/c.txt"), "ccc");
    WriteFileText(In("Tree/sub/.d"), "dddd");
  }
  void TearDown() override { fs::permissions(In("Tree/a.txt"), fs::perms::owner_all); }

  std::string In(const std::string& path) const { return JoinPath(Scratch.Root, Native(path)); }

  const ScratchHistory Scratch;
  const std::string Root = In("Tree");
  const std::string Archive = In("out.zip");
};

bool IsTimeOf(const std::string& path, const tm_unz& date) {
  const CalendarTime time = LastWriteTime(path).value_or(CalendarTime());
  const auto equals = [](auto field, int value) { return static_cast<int>(field) == value; };
  return equals(date.tm_year, time.Year) && equals(date.tm_mon, time.Month - 1) &&
         equals(date.tm_mday, time.Day) && equals(date.tm_hour, time.Hour) &&
         equals(date.tm_min, time.Minute) && equals(date.tm_sec, time.Second / 2 * 2);
}

TEST_F(Zipper, PacksAFolderWithAllItContains) {
  fs::permissions(In("Tree/a.txt"), fs::perms::owner_read);
  CZipper zipper(Archive.c_str(), Root.c_str());
  EXPECT_TRUE(zipper.AddFolder(Root));
  ZipFileInfo info;
  zipper.GetFileInfo(info);
  EXPECT_EQ(info.FileCount, 2U);
  EXPECT_EQ(info.FolderCount, 3U);
  EXPECT_EQ(info.UncompressedSize, 3U);
  EXPECT_TRUE(zipper.Close());

  const auto entries = ReadArchive(Archive);
  EXPECT_EQ(ArchiveNames(Archive), Names({"a.txt", "sub", "sub/b.txt", "sub/empty"}));
  for (const ArchiveEntry& entry : entries) {
    const std::string path = JoinPath(Root, Native(entry.Name));
    EXPECT_EQ(entry.Contents, FileExists(path) ? FileText(path) : "");
    EXPECT_EQ(entry.Attributes, *FileAttributes(path) & ~1U) << entry.Name;
    EXPECT_TRUE(IsTimeOf(path, entry.Date)) << entry.Name;
  }
}

TEST_F(Zipper, NamesEntriesByTheirPaths) {
  std::string otherCase = Root;
  otherCase.replace(otherCase.size() - 4, 4, "tREE");
  const std::string outside = In("a.txt");
  struct {
    std::string Path;
    bool IgnorePath;
    bool Result;
    std::string Name;
  } const cases[] = {
      {"a.txt", false, true, "a.txt"},
      {"./sub/b.txt", false, true, "sub/b.txt"},
      {"sub/b.txt", true, true, "b.txt"},
      {"../Tree/a.txt", false, false, ""},
      {"../Tree/a.txt", true, true, "a.txt"},
      {Root + "/sub/b.txt", false, true, "sub/b.txt"},
      {Root + "//sub/b.txt", false, true, "sub/b.txt"},
      {outside, false, false, ""},
      {outside, true, true, "a.txt"},
      {"none.txt", false, false, ""},
      {"sub", false, false, ""},
  };
  for (const auto& test : cases) {
    CZipper zipper(Archive.c_str(), (Root + kPathSeparator).c_str());
    EXPECT_EQ(zipper.AddFile(Native(test.Path), test.IgnorePath), test.Result) << test.Path;
    zipper.Close();
    EXPECT_EQ(ArchiveNames(Archive), test.Result ? Names{test.Name} : Names()) << test.Path;
  }
}

TEST_F(Zipper, TrimsBlanksBeforeSeparatorsAtBothEnds) {
  const char* cases[][3] = {
      // the text, without its tail, without its head
      {"/a/b/ \t", "/a/b", "a/b/ \t"},
      {"a / //", "a / ", "a / //"},
      {" //x", " //x", "x"},
      {"// x", "// x", " x"},
      {"/", "/", ""},
      {"", "", ""},
  };
  for (const auto& [text, withoutTail, withoutHead] : cases) {
    EXPECT_EQ(TrimTail(Native(text)), Native(withoutTail));
    EXPECT_EQ(TrimHead(Native(text)), Native(withoutHead));
  }
  EXPECT_EQ(CutFolder("C:X/aBc.d", "c:x/Ab"), "c.d");
  EXPECT_EQ(CutFolder("ab", "abc"), std::nullopt);
}

TEST_F(Zipper, AddsFilesElsewhereAndMemory) {
  const std::string memory(5000, 'm');
  CZipper zipper(Archive.c_str(), Root.c_str());
  EXPECT_TRUE(zipper.AddFileWithFolder(In("Tree/sub/b.txt"), Native("to/here")));
  EXPECT_TRUE(zipper.AddBuffer(memory.data(), 5000, Native("to/memory")));
  EXPECT_TRUE(zipper.AddBuffer(nullptr, 0, "nothing"));
  EXPECT_FALSE(zipper.AddFileWithFolder(In("Tree/a.txt"), Root));
  EXPECT_FALSE(zipper.AddBuffer(memory.data(), 1, In("x")));
  EXPECT_EQ(zipper.Counters.FileCount, 3U);
  EXPECT_EQ(zipper.Counters.UncompressedSize, 5002U);
  zipper.Close();

  const auto entries = ReadArchive(Archive);
  ASSERT_EQ(ArchiveNames(Archive), Names({"to/here/b.txt", "to/memory", "nothing"}));
  EXPECT_EQ(entries[1].Contents, memory);
  EXPECT_EQ(entries[1].Attributes, 128U);
  const std::time_t now = std::time(nullptr);
  EXPECT_EQ(static_cast<int>(entries[1].Date.tm_year), std::gmtime(&now)->tm_year + 1900);
}

TEST_F(Zipper, IsIdleWithoutAnArchive) {
  CZipper zipper;
  EXPECT_FALSE(zipper.Open(nullptr));
  EXPECT_FALSE(zipper.Open(""));
  EXPECT_FALSE(zipper.Open(In("none/out.zip").c_str()));
  EXPECT_FALSE(zipper.Open(Root.c_str(), Root.c_str()));
  EXPECT_EQ(zipper.RootFolder, "");
  EXPECT_FALSE(zipper.AddFile(In("Tree/a.txt")));
  EXPECT_FALSE(zipper.AddFolder(Root));
  EXPECT_FALSE(zipper.AddFileWithFolder(In("Tree/a.txt"), "x"));
  EXPECT_FALSE(zipper.AddBuffer("x", 1, "x"));
  EXPECT_TRUE(zipper.Close());
  EXPECT_EQ(zipper.Counters.FolderCount, 0U);
}

TEST_F(Zipper, ReplacesAnArchiveOrAddsToIt) {
  const auto add = [this](bool append, const std::string& path) {
    CZipper zipper;
    EXPECT_TRUE(zipper.Open(Archive.c_str(), nullptr, append));  // its root is the archive's folder
    EXPECT_EQ(zipper.RootFolder, Scratch.Root);
    EXPECT_TRUE(zipper.AddFile(Native(path)));
  };
  add(true, "Tree/a.txt");
  add(true, "Tree/sub/b.txt");
  EXPECT_EQ(ArchiveNames(Archive), Names({"Tree/a.txt", "Tree/sub/b.txt"}));
  add(false, "Tree/sub/b.txt");
  EXPECT_EQ(ArchiveNames(Archive), Names({"Tree/sub/b.txt"}));
}

TEST_F(Zipper, PacksAThingBesideIt) {
  const fs::path before = fs::current_path();
  fs::create_directory(In("v1.2"));
  WriteFileText(In("v1.2/x.txt"), "x");
  fs::current_path(Scratch.Root);
  EXPECT_TRUE(CZipper::ZipFolder("v1.2", /*ignorePath=*/false));
  fs::current_path(before);
  EXPECT_EQ(ArchiveNames(In("v1.2.zip")), Names{"x.txt"});
  EXPECT_TRUE(CZipper::ZipFolder(Root + kPathSeparator, /*ignorePath=*/true));
  EXPECT_EQ(ArchiveNames(In("Tree.zip")), Names({"Tree", "a.txt", "sub", "b.txt", "empty"}));

  EXPECT_TRUE(CZipper::ZipFile(In("Tree/sub/b.txt")));
  EXPECT_EQ(ArchiveNames(In("Tree/sub/b.zip")), Names{"b.txt"});
  EXPECT_FALSE(CZipper::ZipFile(In("Tree/sub/b.zip")));
  EXPECT_EQ(ArchiveNames(In("Tree/sub/b.zip")), Names{"b.txt"});
  EXPECT_FALSE(CZipper::ZipFile(In("none/b.txt")));
  EXPECT_FALSE(CZipper::ZipFolder("", false));
}

TEST_F(Zipper, NeverHoldsItself) {
  WriteFileText(In("Tree/sub/self.zip"), "older");
  fs::create_hard_link(In("Tree/sub/self.zip"), In("Tree/other name"));
  const std::string archive = In("Tree/sub/../sub/self.zip");
  CZipper zipper(archive.c_str(), Root.c_str());
  EXPECT_FALSE(zipper.AddFile(Native("sub/self.zip")));
  EXPECT_TRUE(zipper.AddFolder(Root));
  zipper.Close();
  EXPECT_EQ(ArchiveNames(archive), Names({"a.txt", "sub", "sub/b.txt", "sub/empty"}));
}

}  // namespace
