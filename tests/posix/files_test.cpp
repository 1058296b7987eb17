#include <fcntl.h>
#include <sys/file.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <csignal>
#include <thread>

#include "platform/exclusive_file.h"
#include "platform/files.h"
#include "platform/folder_listing.h"
#include "platform/posix/descriptor.h"
#include "platform/shared_file.h"
#include "tests/platform/contract.h"

namespace {

using namespace std::chrono_literals;

using SpecialFiles = Platform;

TEST_F(SpecialFiles, AreNeitherListedNorOpenedNorWaitedFor) {
  ::mkfifo(In("pipe").c_str(), 0600);
  ::mknod(In("socket").c_str(), S_IFSOCK | 0600, 0);
  fs::create_symlink(Make("file", "text"), In("link"));
  Make("folder/");
  std::string names;
  for (const FolderEntry& entry : ListFolder(Root)) {
    names += entry.Name + ' ';
  }
  EXPECT_EQ(names, ". .. file folder ");
  ::alarm(10);  // ends a test that waits for the other side of the pipe
  for (const std::string& path : {In("pipe"), In("socket")}) {
    ASSERT_TRUE(fs::exists(path));
    EXPECT_FALSE(ExclusiveFile(path).IsOpen()) << path;
    EXPECT_FALSE(SharedFile(path, LinkPolicy::kFollow).IsOpen()) << path;
    EXPECT_FALSE(CopyToNewFile(path, In("copy"), /*trusted=*/Root)) << path;
    EXPECT_EQ(ReadProfileValue(path, "S", "Key", "none", 256), "none") << path;
  }
  ::alarm(0);
}

using ProfileOnPosix = ProfileFile;

TEST_F(ProfileOnPosix, IsReadAgainIfOnlyItsChangeTimeDiffers) {
  EXPECT_EQ(Value(), "old");
  struct stat before = {};
  ASSERT_EQ(::stat(Ini.c_str(), &before), 0);
  std::this_thread::sleep_for(20ms);  // the clock of file times has steps of some milliseconds
  Make("a.ini", "[S]\nKey=new\n");
  const timespec times[] = {before.st_atim, before.st_mtim};
  ASSERT_EQ(::utimensat(AT_FDCWD, Ini.c_str(), times, /*flags=*/0), 0);
  EXPECT_EQ(Value(), "new");
}

TEST_F(ProfileOnPosix, IsUnchangedAfterAFailedReplacement) {
  EXPECT_EQ(Value(), "old");
  std::signal(SIGXFSZ, SIG_IGN);
  rlimit limit = {};
  ASSERT_EQ(::getrlimit(RLIMIT_FSIZE, &limit), 0);
  const rlimit nothing = {0, limit.rlim_max};
  ::setrlimit(RLIMIT_FSIZE, &nothing);
  const bool isWritten = WriteProfileValue(Ini, "S", "Key", "new");
  ::setrlimit(RLIMIT_FSIZE, &limit);
  EXPECT_FALSE(isWritten);
  EXPECT_EQ(Value(), "old");
  EXPECT_EQ(Tree(), "a.ini\n");
}

// An access control list as the kernel takes it: version 2, then tag, permissions and ID of each
// entry. User 65534 may read, and the mask allows reading and writing.
constexpr char accessList[] =
    "\2\0\0\0"
    "\1\0\6\0\xFF\xFF\xFF\xFF"
    "\2\0\4\0\xFE\xFF\0\0"
    "\4\0\0\0\xFF\xFF\xFF\xFF"
    "\x10\0\6\0\xFF\xFF\xFF\xFF"
    "\x20\0\0\0\xFF\xFF\xFF\xFF";
constexpr size_t listSize = sizeof accessList - 1;
constexpr const char* listName = "system.posix_acl_access";

TEST_F(ProfileOnPosix, KeepsOwnerPermissionsAndAccessList) {
  const auto listAfterAWrite = [this](const std::string& value) {
    EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", value));
    char list[100] = {};
    const ssize_t size = ::getxattr(Ini.c_str(), listName, list, sizeof list);
    return std::string(list, size < 0 ? 0 : static_cast<size_t>(size));
  };
  const uid_t owner = ::getuid() == 0 ? 65534 : ::getuid();
  for (const mode_t mode : {0600U, 0640U, 0604U, 04755U}) {
    ASSERT_EQ(::chown(Ini.c_str(), owner, /*group=*/::getgid()), 0);
    ASSERT_EQ(::chmod(Ini.c_str(), mode), 0);
    EXPECT_EQ(listAfterAWrite(std::to_string(mode)), "");
    struct stat status = {};
    ASSERT_EQ(::stat(Ini.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777, mode);
    EXPECT_EQ(status.st_uid, owner);
  }
  // The folder's default list must not be added, and the file's own list must be kept.
  if (::setxattr(Root.c_str(), "system.posix_acl_default", accessList, listSize, 0) != 0) {
    GTEST_SKIP() << "a file system without access control lists";
  }
  ASSERT_EQ(::chmod(Ini.c_str(), 0660), 0);
  EXPECT_EQ(listAfterAWrite("no list"), "");
  ASSERT_EQ(::setxattr(Ini.c_str(), listName, accessList, listSize, /*flags=*/0), 0);
  EXPECT_EQ(listAfterAWrite("with a list"), std::string(accessList, listSize));
}

TEST_F(ProfileOnPosix, WaitsForALockOnlyOnce) {
  const Descriptor folder(::open(Root.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  ASSERT_EQ(::flock(folder.Get(), LOCK_EX), 0);
  ExpectOneWaitForTheLock(Ini);
  ::flock(folder.Get(), LOCK_UN);
  const ProfileGuard guard(Ini);  // a free lock is still taken
  EXPECT_NE(::flock(folder.Get(), LOCK_EX | LOCK_NB), 0);
  LimitProfileLockTime(10s);
}

}  // namespace
