#pragma once

#include <optional>
#include <string>
#include <string_view>

// The shape of a path, as the running system has it. Paths are narrow strings of any length.

// Stands between the parts of every path that the tool builds and of every name in an archive:
// a backslash on Windows, a slash on POSIX.
extern const char kPathSeparator;

// Every character that the system itself takes for a separator: both slashes on Windows.
extern const std::string_view kPathSeparators;

// True for a path that does not depend on a folder put in front of it: one with a ":" anywhere on
// Windows, one with a leading "/" on POSIX.
bool IsRootedPath(const std::string& path);

// The path made absolute over the working directory; it need not exist. Nothing for an empty path
// or one that the system refuses; on Windows also for a result of 260 characters or more.
// Windows: GetFullPathNameA. POSIX: getcwd.
std::optional<std::string> AbsolutePath(const std::string& path);
