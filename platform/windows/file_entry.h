#pragma once

#include <optional>
#include <string>

#include "platform/windows/system.h"

// What the folder above says of one file or folder. Nothing if there is none of that name; a name
// with wildcards, which no file can have, is not taken for a search.
std::optional<WIN32_FIND_DATAA> FindEntry(const std::string& path);

// True for a link to another place: a symbolic link or a junction.
bool IsLink(const WIN32_FIND_DATAA& entry);

// Removes a file, a read-only one too: a copy has the attributes of its source.
void RemoveFile(const std::string& path);
