#include "report/zipper.h"

#include <gtest/gtest.h>

#include <chrono>
#include <ctime>
#include <filesystem>
#include <string>

#include "history/locations.h"
#include "platform/path.h"
#include "report/zip_names.h"
#include "tests/support/archive_reader.h"
#include "tests/support/scratch_history.h"

namespace {

namespace fs = std::filesystem;

// A folder "Tree" to pack, and an archive beside it.
class Zipper : public testing::Test {
 protected:
  void SetUp() override {
    for (const char* path : {"a.txt", "Tree/a.txt", "Tree/sub/b.txt", "Tree/sub/empty/",
                             "Tree/sub/.d", "Tree/.hidden/c.txt"}) {
      Scratch.Make(path);
    }
  }

  const ScratchHistory Scratch;
  const std::string Root = Scratch.In("Tree");
  const std::string Archive = Scratch.In("out.zip");
  const std::string File = Scratch.In("Tree/sub/b.txt");
};

// As an archive packs it: to two seconds.
unsigned long DateOf(const std::string& path) {
  const CalendarTime time = LastWriteTime(path).value_or(CalendarTime());
  const int date = (time.Year - 1980) << 9 | time.Month << 5 | time.Day;
  return static_cast<unsigned long>(date) << 16 |
         static_cast<unsigned long>(time.Hour << 11 | time.Minute << 5 | time.Second / 2);
}

TEST_F(Zipper, PacksAFolderWithAllItContainsButItself) {
  fs::permissions(Scratch.In("Tree/a.txt"), fs::perms::owner_read);
  Scratch.Make("Tree/sub/self.zip");
  fs::create_hard_link(Scratch.In("Tree/sub/self.zip"), Scratch.In("Tree/other name"));
  const std::string archive = Scratch.In("Tree/sub/../sub/self.zip");
  CZipper zipper(archive.c_str(), Root.c_str());
  EXPECT_FALSE(zipper.AddFile(Scratch.Native("sub/self.zip")));
  EXPECT_TRUE(zipper.AddFolder(Root));
  ZipFileInfo info;
  zipper.GetFileInfo(info);
  EXPECT_EQ(info.FileCount, 2U);
  EXPECT_EQ(info.FolderCount, 3U);
  EXPECT_EQ(info.UncompressedSize, 24U);
  EXPECT_TRUE(zipper.Close());
  EXPECT_EQ(ArchiveTree(archive), "a.txt\nsub/\nsub/b.txt\nsub/empty/\n");
  for (const ArchiveEntry& entry : ReadArchive(archive)) {
    const std::string path = Scratch.In("Tree/" + entry.Name);
    EXPECT_EQ(entry.Contents, FileExists(path) ? FileText(path) : "");
    EXPECT_EQ(entry.Attributes, *FileAttributes(path) & ~1U) << entry.Name;
    EXPECT_EQ(entry.Date, DateOf(path)) << entry.Name;
  }
  fs::permissions(Scratch.In("Tree/a.txt"), fs::perms::owner_all);
}

TEST_F(Zipper, NamesEntriesByTheirPaths) {
  // The path, its entry's name, and that with the path ignored; no name if it is not added.
  const char* cases[][3] = {{"a.txt", "a.txt", "a.txt"},
                            {"./sub/b.txt", "sub/b.txt", "b.txt"},
                            {"../Tree/a.txt", "", "a.txt"},
                            {"@/Tree//sub/b.txt", "sub/b.txt", "b.txt"},
                            {"@/a.txt", "", "a.txt"},
                            {"none.txt", "", ""},
                            {"sub", "", ""}};
  for (const auto& [path, fullName, lastPart] : cases) {
    for (const bool ignorePath : {false, true}) {
      const std::string name = ignorePath ? lastPart : fullName;
      CZipper zipper(Archive.c_str(), (Root + kPathSeparator).c_str());
      EXPECT_EQ(zipper.AddFile(Scratch.Native(path), ignorePath), !name.empty()) << path;
      zipper.Close();
      EXPECT_EQ(ArchiveTree(Archive), name.empty() ? "" : name + '\n') << path;
    }
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
    EXPECT_EQ(TrimTail(Scratch.Native(text)), Scratch.Native(withoutTail));
    EXPECT_EQ(TrimHead(Scratch.Native(text)), Scratch.Native(withoutHead));
  }
  EXPECT_EQ(CutFolder("C:X/aBc.d", "c:x/Ab"), "c.d");
  EXPECT_EQ(CutFolder("ab", "abc"), std::nullopt);
}

TEST_F(Zipper, AddsToAnArchiveReplacesItAndCloses) {
  const std::string memory(5000, 'm');
  CZipper zipper(Archive.c_str(), Root.c_str(), /*append=*/true);
  EXPECT_TRUE(zipper.AddBuffer(memory.data(), 5000, Scratch.Native("to/memory")));
  EXPECT_TRUE(zipper.AddBuffer(nullptr, 0, "nothing"));
  EXPECT_FALSE(zipper.AddBuffer(memory.data(), 1, Archive));
  EXPECT_EQ(zipper.Counters.FileCount, 2U);
  EXPECT_EQ(zipper.Counters.UncompressedSize, 5000U);
  EXPECT_TRUE(zipper.Open(Archive.c_str(), Root.c_str(), /*append=*/true));
  EXPECT_TRUE(zipper.AddFileWithFolder(File, Scratch.Native("to/here")));
  EXPECT_FALSE(zipper.AddFileWithFolder(File, Root));
  EXPECT_EQ(zipper.Counters.FileCount, 1U);
  EXPECT_TRUE(zipper.Close());
  EXPECT_EQ(ArchiveTree(Archive), "to/memory\nnothing\nto/here/b.txt\n");
  const ArchiveEntry entry = ReadArchive(Archive).at(0);
  EXPECT_EQ(entry.Contents, memory);
  EXPECT_EQ(entry.Attributes, 128U);
  const std::time_t now = std::time(nullptr);
  EXPECT_EQ(static_cast<int>(entry.Date >> 25) + 80, std::gmtime(&now)->tm_year);

  EXPECT_TRUE(zipper.Open(Archive.c_str()));  // its root is the archive's folder
  EXPECT_TRUE(zipper.AddFile(Scratch.Native("Tree/a.txt")));
  EXPECT_TRUE(zipper.Close());
  EXPECT_EQ(ArchiveTree(Archive), "Tree/a.txt\n");
  for (const char* path : {static_cast<const char*>(nullptr), "", Root.c_str()}) {
    EXPECT_FALSE(zipper.Open(path, Root.c_str()));
  }
  EXPECT_EQ(zipper.RootFolder, "");
  EXPECT_FALSE(zipper.AddFile(File) || zipper.AddFileWithFolder(File, "x"));
  EXPECT_FALSE(zipper.AddFolder(Root) || zipper.AddBuffer("x", 1, "x"));
  EXPECT_EQ(zipper.Counters.FolderCount, 0U);
  EXPECT_TRUE(zipper.Close());
}

TEST_F(Zipper, ReplacesAnOlderArchiveWhenItIsClosed) {
  WriteFileText(Archive, "older");
  const std::string before = Scratch.Tree();
  CZipper zipper(Archive.c_str(), Scratch.Root.c_str());
  EXPECT_TRUE(zipper.AddFile(File));
  EXPECT_FALSE(zipper.AddFile(Archive));
  EXPECT_EQ(FileText(Archive), "older");
  EXPECT_NE(Scratch.Tree(), before);
  EXPECT_TRUE(zipper.Close());
  EXPECT_EQ(ArchiveTree(Archive), "Tree/sub/b.txt\n");
  EXPECT_EQ(Scratch.Tree(), before);

  // What is not a regular file when the archive is finished is not replaced either.
  zipper.Open(Archive.c_str());
  fs::remove(Archive);
  fs::create_directory(Archive);
  EXPECT_FALSE(zipper.Close());
  EXPECT_FALSE(zipper.Open(Archive.c_str()));
  EXPECT_TRUE(fs::is_empty(Archive));
}

TEST_F(Zipper, EndsWhatExceedsALimit) {
  struct {
    ZipLimits Limits;
    bool IsAdded;
    const char* Tree;
  } const cases[] = {{{14, 4}, true, "a.txt\nsub/\nsub/b.txt\nm\n"},
                     {{14, 3}, false, "a.txt\nsub/\nsub/b.txt\n"},
                     {{13, 4}, true, "a.txt\nsub/\nsub/b.txt\nm\n"}};
  fs::remove(Scratch.In("Tree/sub/empty"));
  for (const auto& [limits, isAdded, tree] : cases) {
    CZipper zipper(Archive.c_str(), Root.c_str());
    zipper.Limits = limits;
    EXPECT_TRUE(zipper.AddFolder(Root));
    EXPECT_EQ(zipper.AddBuffer("mm", 2, "m"), isAdded);
    EXPECT_TRUE(zipper.Close());
    EXPECT_EQ(zipper.IsWithinLimits(), isAdded && limits.EntrySize == 14);
    EXPECT_EQ(ArchiveTree(Archive), tree);
    EXPECT_EQ(ReadArchive(Archive).at(2).Contents,
              std::string("Tree/sub/b.txt").substr(0, limits.EntrySize));
    EXPECT_TRUE(zipper.Open(Archive.c_str()) && zipper.IsWithinLimits());
  }
}

TEST_F(Zipper, StoresTheNearestDateOfTheFormat) {
  constexpr unsigned long cases[][2] = {
      // the year, and the packed date and time of its first of July
      {1975, 0x00210000},  // first of January 1980
      {1981, 0x02E10000},
      {2107, 0xFEE10000},
      {2108, 0xFF9FBF7D},  // 31 December 2107, 23:59:58
  };
  for (const auto& [year, date] : cases) {
    tm july = {};
    july.tm_year = static_cast<int>(year) - 1900;
    july.tm_mon = 6;
    july.tm_mday = 1;
    july.tm_isdst = -1;
    const std::chrono::seconds time(std::mktime(&july));
    fs::last_write_time(File, std::chrono::file_clock::from_sys(std::chrono::sys_seconds(time)));
    CZipper zipper(Archive.c_str(), Root.c_str());
    EXPECT_TRUE(zipper.AddFile(File) && zipper.Close());
    EXPECT_EQ(ReadArchive(Archive).at(0).Date, date) << year;
  }
}

TEST_F(Zipper, PacksAThingBesideIt) {
  Scratch.Make("v1.2/x.y.txt");
  const fs::path before = fs::current_path();
  fs::current_path(Scratch.Root);
  EXPECT_TRUE(CZipper::ZipFolder("v1.2", /*ignorePath=*/false));
  fs::current_path(before);
  EXPECT_TRUE(CZipper::ZipFolder(Root + kPathSeparator, /*ignorePath=*/true));
  EXPECT_TRUE(CZipper::ZipFile(Scratch.In("v1.2/x.y.txt")));
  const std::string archive = Scratch.In("v1.2/x.y.zip");
  EXPECT_FALSE(CZipper::ZipFile(archive));
  EXPECT_FALSE(CZipper::ZipFile(Scratch.In("none/b.txt")));
  EXPECT_FALSE(CZipper::ZipFolder("", false));
  EXPECT_EQ(ArchiveTree(Scratch.In("v1.2.zip")), "x.y.txt\n");
  EXPECT_EQ(ArchiveTree(Scratch.In("Tree.zip")), "Tree/\na.txt\nsub/\nb.txt\nempty/\n");
  EXPECT_EQ(ArchiveTree(archive), "x.y.txt\n");
}

}  // namespace
