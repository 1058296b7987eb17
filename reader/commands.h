#pragma once

#include "reader/command_line.h"
#include "reader/terminal_text.h"

// Does what the command line asks for and prints it on standard output. Returns the exit result;
// each failure prints one line on standard error.
int RunCommand(const CommandLine& line, const ViewOptions& options);
