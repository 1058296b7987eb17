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
std::string OutputOf(const std::string& call) {
  std::istringstream words(call);
  ProgramArguments arguments({std::istream_iterator<std::string>(words), {}});
  testing::internal::CaptureStdout();
  testing::internal::CaptureStderr();
  int result = 0;
  if (const auto line =
          ParseCommandLine(arguments.Count(), arguments.Vector(), /*version=*/"1.0", result)) {
    ViewOptions options;
    options.ShowsAll = line->ShowsAll;
    result = RunCommand(*line, options);
  }
  const std::string output = testing::internal::GetCapturedStdout();
  return output + testing::internal::GetCapturedStderr() + "exit code " + std::to_string(result);
}

// The golden session has the calls too, each after "$ orxhistory ".
TEST(Commands, PrintWhatTheGoldenSessionShows) {
  const ScratchHistory scratch;
  scratch.Make("ZEK/ORXHistory/History.ini", Golden("reader_history.ini"));
  scratch.Make("ZEK/ORXHistory/C1/42/ORXInstallEvent.Log",
               Replaced(GoldenReport(), "Copying files\n", "Copying files\nSetting up\n"));
  scratch.Make("ZEK/ORXHistory/C1/42/orx.log");
  const std::string ini = "[7]\nEnd_Time=20261114 22:41:55\nResult=0\n";
  scratch.Make("a.zip", BuildArchive({{"History.ini", ini}, {"../up", ""}}));
  const std::filesystem::path before = std::filesystem::current_path();
  std::filesystem::current_path(scratch.Root);
  const std::string golden = Golden("reader_session.txt");
  std::istringstream lines(golden);
  std::string session;
  for (std::string line; std::getline(lines, line);) {
    if (line.starts_with("$ orxhistory")) {
      session += line + '\n' + OutputOf(line.substr(12)) + "\n\n";
    }
  }
  std::filesystem::current_path(before);
  EXPECT_EQ(session, golden);
  EXPECT_TRUE(FileText(scratch.In("page.html")).starts_with("<!DOCTYPE html>"));
  EXPECT_EQ(FileText(scratch.In("out/History.ini")), ini);
}

}  // namespace
