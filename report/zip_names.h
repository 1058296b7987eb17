#pragma once

#include <optional>
#include <string>

// How paths become the names of archive entries, which keep the platform's separator.

// The text without the white space at its end and then without the separators there. The first
// character is never removed, so that a root stays one.
std::string TrimTail(const std::string& text);

// The text without the white space at its start and then without the separators there.
std::string TrimHead(const std::string& text);

// The path with the extension of its last part replaced; both include the dot.
std::string ReplaceExtension(const std::string& path, const std::string& extension);

// The path without the folder that it begins with; nothing if it begins otherwise. The case of
// ASCII letters does not count. Only characters are compared: "abc" begins with "ab".
std::optional<std::string> CutFolder(const std::string& path, const std::string& folder);
