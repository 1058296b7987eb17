#pragma once

#include <string>

// Paths for a temporary file in the same folder as the given file, to be written and then renamed.
// The names begin with a dot. The file is not created; create it with a call that refuses an
// existing one.

// Always the same name, ".History.tmp" for History.ini: for a writer that holds a lock, and can
// remove what an earlier one left.
std::string FixedPathBeside(const std::string& path);

// A name with 64 random bits: processes that share the folder do not choose the same one, even if
// they run in different containers.
std::string RandomPathBeside(const std::string& path);
