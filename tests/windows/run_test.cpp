// The program as an installer runs it, while other programs hold files. It replaces the machine's
// history, so these tests run only if a variable is set.

#include <cstdlib>
#include <thread>

#include "app/install_history.h"
#include "history/locations.h"
#include "platform/profile_file.h"
#include "tests/platform/contract.h"
#include "tests/windows/holder.h"

namespace {

using namespace std::chrono_literals;

class Run : public Platform {
 protected:
  void SetUp() override {
    if (std::getenv("ORX_REPLACE_HISTORY") == nullptr) {
      GTEST_SKIP() << "ORX_REPLACE_HISTORY is not set: this machine's history would be replaced";
    }
    fs::remove_all(GetHistoryDir());
  }

  // The program's result; its output goes to the file "output". The command interpreter removes the
  // outer quotation marks.
  int Call(const std::string& arguments, const std::string& program = ORX_PROGRAM) const {
    const std::string native = fs::path(program).make_preferred().string();
    return std::system(
        ("\"\"" + native + "\" " + arguments + " >\"" + In("output") + "\"\"").c_str());
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
