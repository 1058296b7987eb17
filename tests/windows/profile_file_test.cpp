#include "platform/profile_file.h"

#include <chrono>
#include <functional>

#include "platform/windows/folder_lock.h"
#include "platform/windows/system.h"
#include "tests/platform/contract.h"
#include "tests/windows/holder.h"

namespace {

using namespace std::chrono_literals;

class ProfileOnWindows : public Platform {
 protected:
  std::function<UniqueHandle()> OpensIni(DWORD access, DWORD share) const {
    return [this, access, share] { return OpenExisting(Ini, access, share); };
  }

  std::string Value() const { return ReadProfileValue(Ini, "S", "Key", "none", 256); }

  const std::string Ini = Make("a.ini", "[S]\nKey=old\n");
};

TEST_F(ProfileOnWindows, WaitsForAProgramThatDoesNotShareTheFileForAMoment) {
  for (const bool isWritten : {false, true}) {
    const Holder holder(OpensIni(GENERIC_READ, /*share=*/0), 150ms);
    EXPECT_EQ(isWritten ? WriteProfileValue(Ini, "T", "Key", "more") : Value() == "old", true);
  }
  EXPECT_EQ(Value(), "old");
  EXPECT_EQ(ReadProfileValue(Ini, "T", "Key", "none", 256), "more");
}

TEST_F(ProfileOnWindows, StaysWholeIfAProgramNeverSharesIt) {
  const ProfileGuard guard(Ini);
  {
    const Holder holder(OpensIni(GENERIC_READ, /*share=*/0), 10s);
    EXPECT_EQ(Value(), "none");
  }
  EXPECT_FALSE(WriteProfileValue(Ini, "S", "Key", "new"));
  { const ProfileGuard inner(Ini); }
  EXPECT_EQ(FileText(Ini), "[S]\nKey=old\n");
}

TEST_F(ProfileOnWindows, IsWrittenInPlaceIfItCannotBeReplaced) {
  const Holder holder(OpensIni(GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE), 10s);
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

}  // namespace
