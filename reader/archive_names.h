#pragma once

#include <string_view>
#include <vector>

#include "reader/archive.h"

// Replaces the separators in the names of an archive's entries, which may be backslashes, by '/'. A
// name that ends in a separator is that of a folder; it loses the separator.
void TurnNamesToPaths(std::vector<ArchiveEntry>& entries);

// True for a path whose parts are names: none is empty, "." or "..", and no NUL is in it.
bool HasPlainParts(std::string_view path);
