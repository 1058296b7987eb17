#pragma once

#include "reader/command_line.h"
#include "reader/terminal_text.h"

// Runs the command and prints its result on standard output. Returns the exit code; each failure
// prints one line on standard error.
int RunCommand(const CommandLine& line, const ViewOptions& options);
