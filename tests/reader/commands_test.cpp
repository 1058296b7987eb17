// Every command of the reader as a user calls it, with what it prints and its exit code.

#include "reader/commands.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <iterator>
#include <sstream>

#include "tests/reader/archive_builder.h"
#include "tests/reader/history_text.h"
#include "tests/support/run_tool.h"
#include "tests/support/scratch_history.h"

namespace {

// What a call prints, its errors last, and its exit code.
std::string OutputOf(const std::string& call, bool hasColours) {
  std::istringstream words(call);
  ProgramArguments arguments({std::istream_iterator<std::string>(words), {}});
  testing::internal::CaptureStdout();
  testing::internal::CaptureStderr();
  int result = 0;
  if (const auto line =
          ParseCommandLine(arguments.Count(), arguments.Vector(), /*version=*/"1.0", result)) {
    ViewOptions options;
    options.HasColours = hasColours;
    options.ShowsAll = line->ShowsAll;
    result = RunCommand(*line, options);
  }
  const std::string output = testing::internal::GetCapturedStdout();
  return output + testing::internal::GetCapturedStderr() + "exit code " + std::to_string(result);
}

// The golden session has the calls too, each after "$ orxhistory ", or "% orxhistory " for one with
// colours, where "^[" is the escape character.
TEST(Commands, PrintWhatTheGoldenSessionShows) {
  const ScratchHistory scratch;
  scratch.Make("ZEK/ORXHistory/History.ini", Golden("reader_history.ini"));
  scratch.Make("ZEK/ORXHistory/C1/42/ORXInstallEvent.Log",
               Replaced(GoldenReport(), "Copying files\n", "Copying files\nSetting up\n"));
  scratch.Make("ZEK/ORXHistory/C1/42/orx.log");
  scratch.Make("ZEK/ORXHistory/C2/44/ORXInstallEvent.Log", "cut off");
  scratch.Make("a.zip",
               BuildArchive({{"History.ini", "[7]\nEnd_Time=20261114 22:41:55\nResult=0\n"},
                             {"A", "", 0x10},
                             {"A/r", "x", 0, 0, 8},
                             {"../up", "x"},
                             {"A/link", "/etc/passwd", 0xA1FFU << 16},
                             {"there", "new"},
                             {"A/r/below", "x"},
                             {"short", "x", 0, 0, 0, 1}}));
  scratch.Make("out/there", "old");
  const std::filesystem::path before = std::filesystem::current_path();
  std::filesystem::current_path(scratch.Root);
  const std::string golden = Golden("reader_session.txt");
  std::istringstream lines(golden);
  std::string session;
  for (std::string line; std::getline(lines, line);) {
    if (line.find("orxhistory") == 2) {
      const std::string output = OutputOf(line.substr(12), line.starts_with('%'));
      session += line + '\n' + Replaced(output, "\x1B", "^[") + "\n\n";
    }
  }
  std::filesystem::current_path(before);
  EXPECT_EQ(session, golden);
  const std::string page = FileText(scratch.In("page.html"));
  EXPECT_EQ(page.substr(0, page.find("<style>")) + page.substr(page.find("</style>")),
            Golden("reader_page.html"));
  const std::string tree = scratch.Tree();
  EXPECT_EQ(tree.substr(tree.find("a.zip")),
            "a.zip\nout/\nout/A/\nout/A/r\nout/History.ini\nout/there\npage.html\n");
  EXPECT_EQ(FileText(scratch.In("out/A/r")) + FileText(scratch.In("out/there")), "xold");
}

}  // namespace
