#include "platform/shared_file.h"

#include <tuple>

#include "platform/new_file.h"
#include "tests/platform/contract.h"

namespace {

std::string Piece(const SharedFile& file, uint64_t offset, size_t size) {
  std::string bytes(size, '#');
  bytes.resize(file.ReadAt(offset, bytes.data(), size));
  return bytes;
}

TEST_F(Platform, SharedFileReadsAtAnyOffset) {
  const SharedFile file(Make("a", "0123456789"), LinkPolicy::kRefuse);
  ASSERT_TRUE(file.IsOpen());
  EXPECT_EQ(file.Size(), 10U);
  const std::tuple<uint64_t, size_t, const char*> cases[] = {
      {0, 10, "0123456789"},      {3, 2, "34"}, {8, 9, "89"}, {10, 1, ""}, {0, 0, ""}, {11, 1, ""},
      {uint64_t{1} << 40, 1, ""},
  };
  for (const auto& [offset, size, text] : cases) {
    EXPECT_EQ(Piece(file, offset, size), text) << offset;
  }
}

TEST_F(Platform, SharedFileLetsOthersReplaceTheFile) {
  const SharedFile file(Make("a", "old"), LinkPolicy::kRefuse);
  fs::rename(In("a"), In("b"));
  Make("a", "new");
  EXPECT_EQ(Piece(file, 0, 10), "old");
  EXPECT_TRUE(fs::remove(In("b")));
}

TEST_F(Platform, SharedFileOpensRegularFilesOnly) {
  for (const std::string& path : {Make("folder/"), In("none"), device, std::string()}) {
    const SharedFile file(path, LinkPolicy::kFollow);
    EXPECT_FALSE(file.IsOpen() || !Piece(file, 0, 1).empty()) << path;
  }
  if (isWindows) {
    return;  // a link needs a privilege there
  }
  fs::create_symlink(Make("file", "text"), In("link"));
  EXPECT_EQ(Piece(SharedFile(In("link"), LinkPolicy::kFollow), 0, 9), "text");
  EXPECT_FALSE(SharedFile(In("link"), LinkPolicy::kRefuse).IsOpen());
}

TEST_F(Platform, NewFileStaysOnlyWhenItIsFinished) {
  { EXPECT_TRUE(NewFile(In("a")).Write("half")); }
  EXPECT_EQ(Tree(), "");
  NewFile file(In("a"));
  EXPECT_TRUE(file.Write("one") && file.Write("") && file.Write(std::string("\0\n", 2)));
  EXPECT_TRUE(file.Finish());
  EXPECT_FALSE(file.Finish() || file.Write("more"));
  EXPECT_EQ(FileText(In("a")), std::string("one\0\n", 5));
  const fs::perms owners = fs::perms::owner_read | fs::perms::owner_write;
  EXPECT_TRUE(isWindows || fs::status(In("a")).permissions() == owners);
}

TEST_F(Platform, NewFileReplacesNothing) {
  for (const std::string& path : {Make("file", "old"), Make("folder/"), In("none/a"), device}) {
    NewFile file(path);
    EXPECT_FALSE(file.IsOpen() || file.Write("new") || file.Finish()) << path;
  }
  EXPECT_EQ(FileText(In("file")), "old");
  if (isWindows) {
    return;
  }
  fs::create_symlink(In("elsewhere"), In("link"));
  EXPECT_FALSE(NewFile(In("link")).IsOpen());
  EXPECT_FALSE(fs::exists(In("elsewhere")));
}

}  // namespace
