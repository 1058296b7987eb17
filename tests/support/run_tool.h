#pragma once

#include <functional>
#include <string>
#include <vector>

// An argument vector as the system passes it to main, starting with the program's name.
class ProgramArguments {
 public:
  explicit ProgramArguments(std::vector<std::string> words);
  int Count() const { return static_cast<int>(Pointers.size()); }
  char** Vector() { return Pointers.data(); }

 private:
  std::vector<std::string> Words;
  std::vector<char*> Pointers;
};

// Runs the tool in this process, as CInstallHistory::Run, and returns its result. Like a process of
// its own it starts with a log stream in its initial format.
int RunTool(std::vector<std::string> words);

// What the call writes to the CLogger stream, from a stream in its initial format on.
std::string LoggedText(const std::function<void()>& write);
