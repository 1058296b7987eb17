// Files that another program, such as a scanner, keeps open.

#include <chrono>
#include <functional>
#include <utility>

#include "eventlog/logger.h"
#include "platform/exclusive_file.h"
#include "platform/files.h"
#include "platform/profile_file.h"
#include "platform/windows/folder_lock.h"
#include "tests/platform/contract.h"
#include "tests/windows/holder.h"

namespace {

using namespace std::chrono_literals;

class ProfileOnWindows : public Platform {
 protected:
  std::string Value() const { return ReadProfileValue(Ini, "S", "Key", "none", 256); }

  const std::string Ini = Make("a.ini", "[S]\nKey=old\n");
};

TEST_F(ProfileOnWindows, WaitsForAProgramThatHoldsTheFileBriefly) {
  for (const bool isWritten : {false, true}) {
    const Holder holder(Ini, /*share=*/0, 150ms);
    EXPECT_EQ(isWritten ? WriteProfileValue(Ini, "T", "Key", "more") : Value() == "old", true);
  }
  EXPECT_EQ(Value(), "old");
  EXPECT_EQ(ReadProfileValue(Ini, "T", "Key", "none", 256), "more");
}

TEST_F(ProfileOnWindows, IsUnchangedIfAProgramNeverSharesIt) {
  const ProfileGuard guard(Ini);
  {
    const Holder holder(Ini, /*share=*/0, 10s);
    EXPECT_EQ(Value(), "none");
  }
  EXPECT_FALSE(WriteProfileValue(Ini, "S", "Key", "new"));
  { const ProfileGuard inner(Ini); }
  EXPECT_EQ(FileText(Ini), "[S]\nKey=old\n");
}

TEST_F(ProfileOnWindows, IsWrittenInPlaceIfItCannotBeReplaced) {
  const Holder holder(Ini, FILE_SHARE_READ | FILE_SHARE_WRITE, 10s);
  for (const std::string& value : {std::string(3000, 'v'), std::string("short")}) {
    EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", value));
    EXPECT_EQ(ReadProfileValue(Ini, "S", "Key", "none", 4000), value);
  }
  EXPECT_EQ(FileText(Ini), "[S]\r\nKey=short\r\n");
  EXPECT_EQ(Tree(), "a.ini\n");
}

TEST_F(ProfileOnWindows, WaitsForALockOnlyOnce) {
  const auto lock = [this] {
    UniqueHandle mutex = OpenFolderMutex(Root + kPathSeparator);
    ::WaitForSingleObject(mutex.get(), INFINITE);
    return mutex;
  };
  const Holder holder(lock, 10s);
  ExpectOneWaitForTheLock(Ini);
  LimitProfileLockTime(10s);
}

using HeldFile = Platform;

TEST_F(HeldFile, IsWaitedFor) {
  const std::string file = Make("file", "text");
  const auto appendToLog = [&file] {
    CLogger& log = CLogger::GetInstance();
    log.Open(file, std::ios::app);
    log << ", more" << std::flush;
    log.Close();
    return FileText(file) == "text, more";
  };
  const std::pair<DWORD, std::function<bool()>> cases[] = {
      {FILE_SHARE_READ, [&] { return ExclusiveFile(file).IsOpen(); }},
      {0, [&] { return CopyToNewFile(file, In("copy"), /*trusted=*/Root); }},
      {FILE_SHARE_READ, appendToLog},
  };
  for (const auto& [share, access] : cases) {
    const Holder holder(file, share, 100ms);
    EXPECT_TRUE(access());
  }
  const Holder holder(file, FILE_SHARE_READ, 10s);
  EXPECT_FALSE(ExclusiveFile(file).IsOpen());
}

}  // namespace
