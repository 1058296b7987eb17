#pragma once

#include <optional>
#include <string>
#include <vector>

// The parsed command line. All texts are in the system's encoding.

enum class Command { kList, kShow, kChanges, kFind, kCheck, kPage, kUnpack };

struct CommandLine {
  Command What = Command::kList;
  std::vector<std::string> From;  // archives and folders; empty for this machine's history
  std::string Encoding;           // empty for Windows-1252
  bool IsJson = false;
  bool OnlyFailed = false;
  bool OnlyOpen = false;
  std::optional<std::string> Copy;  // list only the events of this copy
  bool ShowsAll = false;
  std::string Argument;  // the event, the text, the file or the folder
};

// Nothing if there is nothing left to do: help or the version was printed, and the result is 0, or
// the call is wrong, one line on standard error says how, and the result is 2.
std::optional<CommandLine> ParseCommandLine(int argc, char** argv, const std::string& version,
                                            int& result);
