#pragma once

// Writes the nine lines of the usage text to standard output. Its words and the options that the
// tool takes differ in places; the text is the one that installers know.
void PrintUsage();
