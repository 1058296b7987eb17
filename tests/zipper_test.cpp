#include "report/zipper.h"

#include <gtest/gtest.h>

#include <chrono>
#include <ctime>
#include <filesystem>
#include <string>
#include <tuple>

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

TEST_F(Zipper, PacksAFolderWithAllItContainsButItself) {
  fs::permissions(Scratch.In("Tree/a.txt"), fs::perms::owner_read);
  fs::create_hard_link(Scratch.Make("Tree/sub/self.zip"), Scratch.In("Tree/other name"));
  const std::string archive = Scratch.In("Tree/sub/../sub/self.zip");
  CZipper zipper(archive.c_str(), Root.c_str());
  EXPECT_FALSE(zipper.AddFile(Scratch.Native("sub/self.zip")));
  EXPECT_TRUE(zipper.AddFolder(Root));
  ZipFileInfo info;
  zipper.GetFileInfo(info);
  EXPECT_TRUE(info.FileCount == 2 && info.FolderCount == 3 && info.UncompressedSize == 24);
  EXPECT_TRUE(zipper.Close());
  EXPECT_EQ(ArchiveTree(archive), "a.txt\nsub/\nsub/b.txt\nsub/empty/\n");
  for (const ArchiveEntry& entry : ReadArchive(archive)) {
    const std::string path = Scratch.In("Tree/" + entry.Name);
    EXPECT_EQ(entry.Contents, FileExists(path) ? FileText(path) : "");
    EXPECT_EQ(entry.Attributes, *FileAttributes(path) & ~1U) << entry.Name;
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
  // The text, without its tail, without its head.
  const char* cases[][3] = {{"\r\n/a/b/ \t\v\f\r\n", "\r\n/a/b", "a/b/ \t\v\f\r\n"},
                            {"a / //", "a / ", "a / //"},
                            {" //x", " //x", "x"},
                            {"// x", "// x", " x"},
                            {"/", "/", ""},
                            {"", "", ""}};
  for (const auto& [text, withoutTail, withoutHead] : cases) {
    EXPECT_EQ(TrimTail(Scratch.Native(text)), Scratch.Native(withoutTail));
    EXPECT_EQ(TrimHead(Scratch.Native(text)), Scratch.Native(withoutHead));
  }
  EXPECT_EQ(CutFolder("C:X/aBc.d", "c:x/Ab"), "c.d");
  EXPECT_EQ(CutFolder("ab", "abc"), std::nullopt);
}

TEST_F(Zipper, AddsToAnArchive) {
  const std::string memory(5000, 'm');
  CZipper zipper(Archive.c_str(), Root.c_str(), /*append=*/true);
  EXPECT_TRUE(zipper.AddBuffer(memory.data(), 5000, Scratch.Native("to/memory")));
  EXPECT_TRUE(zipper.AddBuffer(nullptr, 0, "nothing"));
  EXPECT_FALSE(zipper.AddBuffer(memory.data(), 1, Archive));
  EXPECT_TRUE(zipper.Counters.FileCount == 2 && zipper.Counters.UncompressedSize == 5000);
  EXPECT_TRUE(zipper.Open(Archive.c_str(), Root.c_str(), /*append=*/true));
  EXPECT_TRUE(zipper.AddFileWithFolder(File, Scratch.Native("to/here")));
  EXPECT_FALSE(zipper.AddFileWithFolder(File, Root));
  EXPECT_EQ(zipper.Counters.FileCount, 1U);
  EXPECT_TRUE(zipper.Close());
  EXPECT_EQ(ArchiveTree(Archive), "to/memory\nnothing\nto/here/b.txt\n");
  const ArchiveEntry entry = ReadArchive(Archive).at(0);
  EXPECT_TRUE(entry.Contents == memory && entry.Attributes == 128);
  const std::time_t now = std::time(nullptr);
  EXPECT_EQ(static_cast<int>(entry.Date >> 25) + 80, std::gmtime(&now)->tm_year);
}

TEST_F(Zipper, ReplacesAnOlderArchiveWhenItIsClosed) {
  WriteFileText(Archive, "older");
  const std::string before = Scratch.Tree();
  CZipper zipper(Archive.c_str());  // its root is the archive's folder
  EXPECT_TRUE(zipper.AddFile(Scratch.Native("Tree/sub/b.txt")));
  EXPECT_FALSE(zipper.AddFile(Archive));
  EXPECT_EQ(FileText(Archive), "older");
  EXPECT_TRUE(zipper.Close());
  EXPECT_EQ(ArchiveTree(Archive), "Tree/sub/b.txt\n");
  EXPECT_EQ(Scratch.Tree(), before);

  // What is not a regular file when the archive is finished is not replaced either.
  zipper.Open(Archive.c_str());
  fs::remove(Archive);
  fs::create_directory(Archive);
  EXPECT_FALSE(zipper.Close());
  EXPECT_TRUE(fs::is_empty(Archive));
}

TEST_F(Zipper, DoesNothingWithoutAnArchive) {
  const std::string link = Scratch.In("link.zip");
  std::error_code noLinks;  // they are not possible everywhere
  fs::create_symlink(Scratch.In("a.txt"), link, noLinks);
  CZipper zipper(Archive.c_str());
  for (const bool append : {false, true}) {
    EXPECT_TRUE(noLinks || !zipper.Open(link.c_str(), Root.c_str(), append));
    EXPECT_FALSE(zipper.Open(nullptr) || zipper.Open("") || zipper.Open(Root.c_str()));
  }
  EXPECT_EQ(zipper.RootFolder, "");
  EXPECT_FALSE(zipper.AddFile(File) || zipper.AddFileWithFolder(File, "x"));
  EXPECT_FALSE(zipper.AddFolder(Root) || zipper.AddBuffer("x", 1, "x"));
  EXPECT_EQ(zipper.Counters.FolderCount, 0U);
  EXPECT_TRUE(zipper.Close());
}

TEST_F(Zipper, EndsWhatExceedsALimit) {
  fs::remove(Scratch.In("Tree/sub/empty"));
  for (const ZipLimits& limits : {ZipLimits{14, 4}, ZipLimits{14, 3}, ZipLimits{13, 4}}) {
    const bool isAdded = limits.Entries == 4;
    CZipper zipper(Archive.c_str(), Root.c_str());
    zipper.Limits = limits;
    EXPECT_TRUE(zipper.AddFolder(Root));
    EXPECT_EQ(zipper.AddBuffer("mm", 2, "m"), isAdded);
    EXPECT_TRUE(zipper.Close());
    EXPECT_EQ(zipper.IsWithinLimits(), isAdded && limits.EntrySize == 14);
    EXPECT_EQ(ArchiveTree(Archive),
              std::string("a.txt\nsub/\nsub/b.txt\n") + (isAdded ? "m\n" : ""));
    EXPECT_EQ(ReadArchive(Archive).at(2).Contents,
              std::string("Tree/sub/b.txt").substr(0, limits.EntrySize));
    EXPECT_TRUE(zipper.Open(Archive.c_str()) && zipper.IsWithinLimits());
    EXPECT_TRUE(zipper.AddBuffer("mm", 2, "m"));
  }
}

TEST_F(Zipper, StoresTheNearestDateOfTheFormat) {
  constexpr std::pair<int, unsigned long> cases[] = {
      // the year, and the date and time of its second of July, 13:37:51, as packed
      {1975, 0x00210000},  // first of January 1980
      {1981, 0x02E26CB9},
      {2107, 0xFEE26CB9},
      {2108, 0xFF9FBF7D},  // 31 December 2107, 23:59:58
  };
  for (const auto& [year, date] : cases) {
    tm july = {};
    std::tie(july.tm_sec, july.tm_min, july.tm_hour, july.tm_mday, july.tm_mon, july.tm_year,
             july.tm_isdst) = std::tuple(51, 37, 13, 2, 6, year - 1900, -1);
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
  EXPECT_FALSE(CZipper::ZipFile(archive) || CZipper::ZipFile(Scratch.In("none/b.txt")));
  EXPECT_FALSE(CZipper::ZipFolder("", false));
  EXPECT_EQ(ArchiveTree(Scratch.In("v1.2.zip")), "x.y.txt\n");
  EXPECT_EQ(ArchiveTree(Scratch.In("Tree.zip")), "Tree/\na.txt\nsub/\nb.txt\nempty/\n");
  EXPECT_EQ(ArchiveTree(archive), "x.y.txt\n");
}

}  // namespace
