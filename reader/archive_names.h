#pragma once

#include <string_view>
#include <vector>

#include "reader/archive.h"

// Turns the names of an archive's entries, by whatever separator its maker used, into paths whose
// parts are joined by '/'. A name that ends in a separator is that of a folder.
void TurnNamesToPaths(std::vector<ArchiveEntry>& entries);

// True for a path whose parts are names: none is empty, "." or "..", and no NUL is in it.
bool HasPlainParts(std::string_view path);
