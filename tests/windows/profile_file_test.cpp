#include "platform/profile_file.h"

#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <semaphore>
#include <thread>

#include "platform/windows/folder_lock.h"
#include "platform/windows/system.h"
#include "tests/platform/contract.h"

namespace {

using namespace std::chrono_literals;
using std::chrono::steady_clock;

// Another program: what it acquires it keeps until the object ends, or for the time given.
class Holder {
 public:
  Holder(std::function<UniqueHandle()> acquire, steady_clock::duration time)
      : Thread([this, acquire = std::move(acquire), time] {
          const UniqueHandle held = acquire();
          IsHeld = held != nullptr;
          Acquired.release();
          Ended.try_acquire_for(time);
        }) {
    Acquired.acquire();
    EXPECT_TRUE(IsHeld);
  }
  ~Holder() {
    Ended.release();
    Thread.join();
  }
  Holder(const Holder&) = delete;
  Holder& operator=(const Holder&) = delete;

 private:
  bool IsHeld = false;
  std::binary_semaphore Acquired{0};
  std::binary_semaphore Ended{0};
  std::thread Thread;
};

class ProfileOnWindows : public Platform {
 protected:
  std::function<UniqueHandle()> OpensIni(DWORD access, DWORD share) const {
    return [this, access, share] {
      return OwnIfValid(::CreateFileA(Ini.c_str(), access, share, /*lpSecurityAttributes=*/nullptr,
                                      OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL,
                                      /*hTemplateFile=*/nullptr));
    };
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
  LimitProfileLockTime(60ms);
  const auto begin = steady_clock::now();
  EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", "first"));
  const auto middle = steady_clock::now();
  EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", "second"));
  EXPECT_GE(middle - begin, 60ms);
  EXPECT_LT(steady_clock::now() - middle, 50ms);
  EXPECT_EQ(Value(), "second");
  EXPECT_EQ(Tree(), "a.ini\n");
  LimitProfileLockTime(10s);
}

}  // namespace
