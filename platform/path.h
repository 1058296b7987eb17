#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

// The form of a path on the running system. Paths are narrow strings in the system's code page, of
// any length. In some code pages the second byte of a two-byte character can equal a separator, so
// separators are searched for only here, character by character.

// Separates the parts of every path that the tool builds and of every entry name in an archive: a
// backslash on Windows, a slash on POSIX.
extern const char kPathSeparator;

// Every character that the system takes for a separator: both slashes on Windows.
extern const std::string_view kPathSeparators;

// True for the first byte of a two-byte character. Windows: IsDBCSLeadByteEx with the code page
// that the file calls use. POSIX: always false, as the kernel compares bytes.
bool IsLeadByte(char byte);

// The offset of the first separator at or after an offset that begins a character, else npos.
size_t FindSeparator(std::string_view path, size_t begin = 0);

// The offset after the last separator; 0 without one.
size_t AfterLastSeparator(std::string_view path);

bool EndsWithSeparator(std::string_view path);

// The folder and the name with a separator between them, unless the folder is empty or ends with
// one. An empty name adds nothing after the separator.
std::string JoinPath(const std::string& folder, const std::string& name);

// The path up to its last part, including the separator or the drive's colon; may be empty.
std::string FolderPart(const std::string& path);

// The last part of the path; empty if the path ends with a separator.
std::string BaseName(const std::string& path);

// True for a path that does not depend on a folder put in front of it: one with a ":" anywhere on
// Windows, one with a leading "/" on POSIX.
bool IsRootedPath(const std::string& path);

// False for a part of a path that the system would not keep as it is, so that it would name another
// file, or a device. Windows: a part that ends with a blank or point (but "." and ".." are kept),
// one with a control character or one of <>:"|?*, and the device names CON, PRN, AUX, NUL, CONIN$,
// CONOUT$, COM and LPT with a digit, whatever their case and extension. POSIX: never false.
bool IsKeptName(std::string_view part);

// False if the path is too long for a file. Windows: 260 characters (UTF-16 units) or more. POSIX:
// PATH_MAX bytes or more.
bool FitsPathLimit(const std::string& path);

// The path made absolute over the working directory; it need not exist. Nothing for an empty path
// or one that the system refuses; on Windows also for a result of 260 bytes or more.
// Windows: GetFullPathNameA. POSIX: getcwd.
std::optional<std::string> AbsolutePath(const std::string& path);
