#pragma once

#include <memory>
#include <optional>
#include <string>

#include "platform/windows/system.h"

struct SearchCloser {
  void operator()(HANDLE search) const { ::FindClose(search); }
};
using UniqueSearch = std::unique_ptr<void, SearchCloser>;

// Starts a search for the entries that match a pattern and returns the first one with it
// (FindFirstFileA); empty if there is none.
UniqueSearch FindFirst(const std::string& pattern, WIN32_FIND_DATAA& first);

// The entry of one file or folder in its parent folder. Nothing if there is none of that name, and
// for a name with wildcards, which no file can have.
std::optional<WIN32_FIND_DATAA> FindEntry(const std::string& path);

// True for an entry that leads to another path: a symbolic link, a junction, or a reparse point
// whose tag says so or is not known. The others (files kept in the cloud, deduplicated or
// compressed ones) are the file itself, stored elsewhere.
bool IsLink(const WIN32_FIND_DATAA& entry);

// Removes a file, even if it is read-only, as a copy of such a file is (DeleteFileA).
void RemoveFile(const std::string& path);
