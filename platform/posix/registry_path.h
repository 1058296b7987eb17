#pragma once

#include <string_view>

// Paths of keys below HKEY_LOCAL_MACHINE: names with one backslash between them. The empty path is
// that key itself.

// Whether a path is the other one or lies below it.
bool IsAtOrBelow(std::string_view path, std::string_view top);

// The first name of a path, which is taken off it.
std::string_view TakeFirstName(std::string_view& path);

// What stands in front of the last name; empty if it is the only one.
std::string_view ParentOf(std::string_view path);

// The last name of a path.
std::string_view LastNameOf(std::string_view path);

// Whether a name in the path is empty, so that it is the path of no key.
bool HasEmptyName(std::string_view path);
