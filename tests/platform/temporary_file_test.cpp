#include "platform/temporary_file.h"

#include "tests/platform/contract.h"

namespace {

using TemporaryFiles = Platform;

TEST_F(TemporaryFiles, HaveNamesOfTheirOwnAndAreRemoved) {
  {
    const TemporaryFile first(In("target"));
    const TemporaryFile second(In("target"));
    for (const TemporaryFile* file : {&first, &second}) {
      ASSERT_TRUE(file->Exists());
      EXPECT_EQ(FolderPart(file->Path()), FolderPart(In("target")));
      EXPECT_TRUE(BaseName(file->Path()).starts_with('.'));
      EXPECT_EQ(fs::file_size(file->Path()), 0U);
      const fs::perms owners = fs::perms::owner_read | fs::perms::owner_write;
      EXPECT_TRUE(isWindows || fs::status(file->Path()).permissions() == owners);
    }
    EXPECT_NE(first.Path(), second.Path());
  }
  EXPECT_EQ(Tree(), "");
  TemporaryFile none(In("none/target"));
  EXPECT_FALSE(none.Exists() || none.Replace() || none.MoveToNew());
}

TEST_F(TemporaryFiles, TakeThePlaceOfARegularFileOnly) {
  Make("old", "old");
  Make("folder/");
  std::error_code error;  // links are not possible everywhere
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
