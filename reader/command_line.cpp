#include "reader/command_line.h"

#include <CLI/CLI.hpp>
#include <iostream>

#include "reader/terminal_text.h"
#include "reader/text_encoding.h"

namespace {

void AddListOptions(CLI::App& list, CommandLine& line) {
  list.add_flag("--failed", line.OnlyFailed, "Only events that failed");
  list.add_flag("--open", line.OnlyOpen, "Only events that were started and not ended");
  list.add_option("--copy", line.Copy, "Only events of this copy")->type_name("NAME");
}

struct CommandText {
  Command What;
  const char* Name;
  const char* Description;
  const char* Argument;  // its name; null for none
  const char* ArgumentDescription;
};

constexpr CommandText kCommands[] = {
    {Command::kList, "list", "One line for each event, oldest start first", nullptr, nullptr},
    {Command::kShow, "show", "An event's facts, messages, files and changes", "EVENT",
     "The event's identity"},
    {Command::kChanges, "changes", "What an event changed on the machine", "EVENT",
     "The event's identity"},
    {Command::kFind, "find", "Every fact, message and change that contains a text", "TEXT",
     "The text; upper and lower case are the same"},
    {Command::kCheck, "check", "What is wrong or missing in the history", nullptr, nullptr},
    {Command::kPage, "page", "The whole history as one self-contained page", "FILE.html",
     "Where to; an older page is replaced"},
    {Command::kUnpack, "unpack", "The archive's tree as files", "FOLDER",
     "Where to; made if it is not there"}};

void AddCommand(CLI::App& app, const CommandText& text, CommandLine& line) {
  CLI::App* command = app.add_subcommand(text.Name, text.Description);
  command->callback([&line, what = text.What] { line.What = what; });
  if (text.Argument != nullptr) {
    command->add_option(text.Argument, line.Argument, text.ArgumentDescription)
        ->required()
        ->type_name("");
  }
  if (text.What != Command::kPage && text.What != Command::kUnpack) {
    command->add_flag("--json", line.IsJson, "One JSON object a line");
  }
  if (text.What == Command::kList) {
    AddListOptions(*command, line);
  }
  if (text.What == Command::kShow || text.What == Command::kChanges) {
    command->add_flag("--all", line.ShowsAll, "Fold nothing");
  }
}

void DefineCommandLine(CLI::App& app, const std::string& version, CommandLine& line) {
  app.allow_windows_style_options(false);
  app.fallthrough();
  app.set_version_flag("--version", "orxhistory " + version);
  app.add_option("--from", line.From,
                 "A history to read, this machine's by default; can be given several times")
      ->type_name("ARCHIVE|FOLDER")
      ->allow_extra_args(false);
  app.add_option("--encoding", line.Encoding,
                 "Of text that is not UTF-8, Windows-1252 by default; CP932 and so on")
      ->type_name("NAME");
  app.footer(
      "Exit codes: 0 done; 1 check found an error or a warning, find found nothing;\n"
      "2 a history cannot be read, an event is not there, or the call is wrong.");
  for (const CommandText& text : kCommands) {
    AddCommand(app, text, line);
  }
  app.require_subcommand(0, 1);
}

// Printable, as an argument may contain line breaks.
void PrintError(const std::string& text) {
  std::cerr << "orxhistory: " << Printable(TextDecoder().ToUtf8(text))
            << " (orxhistory --help shows the commands)" << std::endl;
}

// What is wrong with the call as a whole; empty for one that is right.
std::string WhatIsWrong(const CLI::App& app, const CommandLine& line) {
  if (app.get_subcommands().empty()) {
    return "Name a command, such as list";
  }
  const bool takesOne = line.What == Command::kPage || line.What == Command::kUnpack;
  if (takesOne && line.From.size() > 1) {
    return "The commands page and unpack take one --from";
  }
  if (line.What == Command::kUnpack && line.From.empty()) {
    return "The command unpack needs --from ARCHIVE";
  }
  return "";
}

}  // namespace

std::optional<CommandLine> ParseCommandLine(int argc, char** argv, const std::string& version,
                                            int& result) {
  CommandLine line;
  CLI::App app("Reads an installation history, on this machine or in an archive.", "orxhistory");
  DefineCommandLine(app, version, line);
  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    if (error.get_exit_code() == 0) {
      app.exit(error);  // prints help or the version
      result = 0;
      return std::nullopt;
    }
    PrintError(error.what());
    result = 2;
    return std::nullopt;
  }
  if (const std::string wrong = WhatIsWrong(app, line); !wrong.empty()) {
    PrintError(wrong);
    result = 2;
    return std::nullopt;
  }
  return line;
}
