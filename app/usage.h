#pragma once

// Writes the nine lines of the usage text to standard output. They are fixed, and they differ from
// the options that the program takes.
void PrintUsage();

// Writes the usage, an empty line, and the operations and options that the program does take.
void PrintHelp();
