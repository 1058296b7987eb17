#include <sys/stat.h>
#include <unistd.h>

#include "platform/exclusive_file.h"
#include "platform/files.h"
#include "platform/folder_listing.h"
#include "platform/shared_file.h"
#include "tests/platform/contract.h"

namespace {

class SpecialFiles : public Platform {
 protected:
  void SetUp() override {
    ASSERT_EQ(::mkfifo(In("pipe").c_str(), 0600), 0);
    ASSERT_EQ(::mknod(In("socket").c_str(), S_IFSOCK | 0600, 0), 0);
    fs::create_symlink(Make("file", "text"), In("link"));
    ::alarm(10);  // ends a test that waits for the other side of the pipe
  }
  void TearDown() override { ::alarm(0); }
};

TEST_F(SpecialFiles, AreNeitherOpenedNorWaitedFor) {
  for (const std::string& path : {In("pipe"), In("socket")}) {
    EXPECT_FALSE(ExclusiveFile(path).IsOpen()) << path;
    EXPECT_FALSE(SharedFile(path, LinkPolicy::kFollow).IsOpen()) << path;
    EXPECT_FALSE(CopyToNewFile(path, In("copy"), /*trusted=*/Root)) << path;
    EXPECT_EQ(ReadProfileValue(path, "S", "Key", "none", 256), "none") << path;
  }
}

TEST_F(SpecialFiles, AreNotListed) {
  Make("folder/");
  std::string names;
  for (const FolderEntry& entry : ListFolder(Root)) {
    names += entry.Name + ' ';
  }
  EXPECT_EQ(names, ". .. file folder ");
}

}  // namespace
