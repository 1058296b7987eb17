// The program as an installer runs it, and files that other programs, such as a scanner, keep open.

#include <fcntl.h>
#include <io.h>
#include <process.h>
#include <sys/stat.h>

#include <chrono>
#include <functional>
#include <future>
#include <thread>
#include <utility>

#include "app/install_history.h"
#include "eventlog/logger.h"
#include "history/locations.h"
#include "platform/exclusive_file.h"
#include "platform/files.h"
#include "platform/windows/file_handle.h"
#include "platform/windows/folder_lock.h"
#include "tests/platform/contract.h"

namespace {

using namespace std::chrono_literals;

// Another program: it keeps what it has acquired until the object ends or the time has passed.
class Holder {
 public:
  Holder(const std::function<UniqueHandle()>& acquire, std::chrono::steady_clock::duration time)
      : Thread([this, acquire, time] {
          const UniqueHandle held = acquire();
          Acquired.set_value(held != nullptr);
          Ended.get_future().wait_for(time);
        }) {
    EXPECT_TRUE(Acquired.get_future().get());
  }
  // It has a file open for reading.
  Holder(const std::string& path, DWORD share, std::chrono::steady_clock::duration time)
      : Holder([&] { return OpenExisting(path, GENERIC_READ, share); }, time) {}
  ~Holder() {
    Ended.set_value();
    Thread.join();
  }
  Holder(const Holder&) = delete;
  Holder& operator=(const Holder&) = delete;

 private:
  std::promise<bool> Acquired;
  std::promise<void> Ended;
  std::thread Thread;
};

using ProfileOnWindows = ProfileFile;

TEST_F(ProfileOnWindows, WaitsForAProgramThatHoldsTheFileBriefly) {
  for (const bool isWritten : {false, true}) {
    const Holder holder(Ini, /*share=*/0, 150ms);
    EXPECT_TRUE(isWritten ? WriteProfileValue(Ini, "T", "Key", "more") : Value() == "old");
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

// They replace the machine's history, so they run only if a variable is set.
class Run : public Platform {
 protected:
  void SetUp() override {
    if (std::getenv("ORX_REPLACE_HISTORY") == nullptr) {
      GTEST_SKIP() << "ORX_REPLACE_HISTORY is not set: this machine's history would be replaced";
    }
    fs::remove_all(GetHistoryDir());
  }

  // The program's exit code, -1 if it does not start; its output goes to the file "output". Started
  // without a command interpreter, which fails now and then on a busy machine.
  int Call(const std::string& arguments, const std::string& program = ORX_PROGRAM) const {
    const std::string path = fs::path(program).make_preferred().string();
    const int ownOutput = ::_dup(STDOUT_FILENO);
    const int output = ::_open(In("output").c_str(), _O_WRONLY | _O_CREAT | _O_TRUNC, _S_IWRITE);
    ::_dup2(output, STDOUT_FILENO);
    ::_close(output);
    const intptr_t code =
        ::_spawnl(_P_WAIT, path.c_str(), ('"' + path + '"').c_str(), arguments.c_str(), nullptr);
    ::_dup2(ownOutput, STDOUT_FILENO);
    ::_close(ownOutput);
    return static_cast<int>(code);
  }

  static std::string InHistory(const std::string& name) { return JoinPath(GetHistoryDir(), name); }
};

TEST_F(Run, RefusesNamesThatLeadToOtherEvents) {
  EXPECT_EQ(Call("-start 42 -Product first"), 0);
  const std::string log = FileText(InHistory("42\\ORXInstallEvent.Log"));
  EXPECT_NE(log, "");
  for (const std::string name :
       {"42.", "42 ", "42. .", "42::$DATA", "x\\..\\42", "aux", "42.\\x"}) {
    EXPECT_EQ(Call("-start \"" + name + "\" -Product second"), 0) << name;
    EXPECT_EQ(FileText(In("output")).find(" Failed to create path:"), 0U) << name;
    EXPECT_EQ(FileText(InHistory("42\\ORXInstallEvent.Log")), log) << name;
  }
  for (const std::string copy : {"C.", "C ", "nul"}) {
    EXPECT_EQ(Call("-end 42 -CopyName \"" + copy + "\""), 0) << copy;
    EXPECT_TRUE(fs::exists(InHistory("42"))) << copy;
  }
}

TEST_F(Run, RefusesAFolderWhoseLogPathIsTooLong) {
  const size_t longest = 259 - InHistory("\\ORXInstallEvent.Log").size();
  for (const size_t length : {longest, longest + 1}) {
    const std::string name(length, 'x');
    EXPECT_EQ(Call("-start " + name), 0);
    EXPECT_EQ(fs::exists(InHistory(name)), length == longest) << length;
    EXPECT_EQ(FileText(In("output")).empty(), length == longest) << length;
  }
}

TEST_F(Run, CountsWhileAProgramOpensTheHistoryFileAgainAndAgain) {
  EXPECT_EQ(Call("-start 0"), 0);
  constexpr int32_t starts = 12;
  std::jthread viewer([](const std::stop_token& stop) {
    while (!stop.stop_requested()) {
      {
        const UniqueHandle file = OpenExisting(GetHistoryFilePath(), GENERIC_READ, /*share=*/0);
        std::this_thread::sleep_for(8ms);
      }
      std::this_thread::sleep_for(3ms);
    }
  });
  for (int32_t i = 1; i < starts; ++i) {
    EXPECT_EQ(Call("-start " + std::to_string(i)), 0);
  }
  viewer.request_stop();
  viewer.join();
  EXPECT_EQ(ReadProfileInt(GetHistoryFilePath(), "History", "Count", 0), starts);
}

TEST_F(Run, WaitsForASummaryThatIsHeld) {
  EXPECT_EQ(Call("-start 1"), 0);
  const std::string summary = InHistory("Summary.txt");
  WriteFileText(summary, "old");
  const Holder holder(summary, FILE_SHARE_READ, 100ms);
  CInstallHistory().WriteSummary();
  EXPECT_NE(FileText(summary), "old");
}

// Under Wine this needs WINEDLLOVERRIDES, as in CMakeLists.txt: else its own libraries come first.
TEST_F(Run, LoadsNoLibraryFromItsOwnFolder) {
  fs::copy(ORX_PROGRAM, In("program.exe"));
  for (const char* library : {"netapi32.dll", "psapi.dll", "secur32.dll", "shfolder.dll"}) {
    fs::copy(ORX_PLANTED_LIBRARY, In(library));
    EXPECT_EQ(Call("-start 1", In("program.exe")), 0) << library;
    fs::remove(In(library));
  }
}

}  // namespace
