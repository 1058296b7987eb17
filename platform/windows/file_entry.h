#pragma once

#include <optional>
#include <string>

#include "platform/windows/system.h"

// The entry of one file or folder in its parent folder. Nothing if there is none of that name; a
// name with wildcards, which no file can have, is not taken for a search.
std::optional<WIN32_FIND_DATAA> FindEntry(const std::string& path);

// True for an entry that leads to another path: a symbolic link, a junction, or a reparse point
// whose tag says so or is not known. The others (files kept in the cloud, deduplicated or
// compressed ones) are the file itself, stored elsewhere.
bool IsLink(const WIN32_FIND_DATAA& entry);

// Removes a file, a read-only one too: a copy has the attributes of its source.
void RemoveFile(const std::string& path);
