#include "tests/support/run_tool.h"

#include <ios>
#include <sstream>

#include "app/install_history.h"
#include "eventlog/logger.h"

ProgramArguments::ProgramArguments(std::vector<std::string> words) : Words(std::move(words)) {
  Words.insert(Words.begin(), "ORXInstallEventLog");
  for (std::string& word : Words) {
    Pointers.push_back(word.data());
  }
}

static void ResetLogFormat() { CLogger::GetInstance().copyfmt(std::ios(nullptr)); }

int RunTool(std::vector<std::string> words) {
  ResetLogFormat();
  ProgramArguments arguments(std::move(words));
  return CInstallHistory().Run(arguments.Count(), arguments.Vector());
}

std::string LoggedText(const std::function<void()>& write) {
  ResetLogFormat();
  std::stringbuf text;
  std::ios& log = CLogger::GetInstance();
  std::streambuf* file = log.rdbuf(&text);
  write();
  log.rdbuf(file);
  return text.str();
}
