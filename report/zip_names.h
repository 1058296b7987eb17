#pragma once

#include <optional>
#include <string>

// How paths become the names of archive entries. Separators are the platform's own, in the names
// too.

// The text without the white space at its end and then without the separators there; the first
// character stays in any case, so that the root of a tree remains one.
std::string TrimTail(const std::string& text);

// The text without the white space at its start and then without the separators there.
std::string TrimHead(const std::string& text);

// The path with the extension, with its point, in place of that of its last part.
std::string ReplaceExtension(const std::string& path, const std::string& extension);

// What follows the folder at the start of the path, in whatever case its ASCII letters are; nothing
// if the path starts otherwise. Only characters are compared: "ab" is at the start of "abc".
std::optional<std::string> CutFolder(const std::string& path, const std::string& folder);
