#pragma once

#include <cstdint>
#include <string>

// Profile files: sections in square brackets, below them lines of key=value. Names compare without
// regard to case; sections and keys keep the order in which they were first written.
//
// Every operation is one complete access to the named file: what one process writes, the next read
// of any process sees. No argument may hold a line break or a NUL.
// A write replaces the whole file in one step, so that no reader meets half of it.
// Windows: the system's profile calls, on a copy of the file while they write, as they write in
// place; a program that keeps the file open and does not share its deletion makes a write fail.
// POSIX: our own reader and writer, which parses a file once for each change of it.

// The value of a key, at most size - 1 bytes of it, without the blanks around it and without one
// pair of quotation marks, double or single, that encloses it. Without the file, the section or
// the key: the fallback, cut in the same way. Windows: GetPrivateProfileStringA.
std::string ReadProfileValue(const std::string& path, const std::string& section,
                             const std::string& key, const std::string& fallback, uint32_t size);

// Sets a key, making file, section and key where they are missing; never a folder. False if the
// file cannot be read or written, and then it is as it was. Windows: WritePrivateProfileStringA.
bool WriteProfileValue(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value);

// The decimal digits, with a minus sign or none, at the start of a key's value; 0 for other text.
// Without the file, the section or the key: the fallback. Windows: GetPrivateProfileIntA.
int32_t ReadProfileInt(const std::string& path, const std::string& section, const std::string& key,
                       int32_t fallback);

// The names of all sections in file order, each ended by a NUL, and one more NUL, together at most
// size bytes. Names that do not fit are missing, and the last one may be cut short; two NULs end
// the text all the same. Two NULs for no file. Windows: GetPrivateProfileSectionNamesA.
std::string ReadProfileSectionNames(const std::string& path, uint32_t size);

// Keeps the accesses to a profile file that belong together from mixing with those of other
// processes: while one lives, no other process changes the file or holds a guard of it. Guards of
// one process nest. The system frees the guard of a process that dies.
//
// Writes under a guard are seen by reads at once; in the file they all stand when the outermost
// guard has ended, in one replacement of the file, or, if that fails, none of them.
// Without the file's folder there is nothing to guard, and the object does nothing.
// Windows: a named mutex of the whole machine, which reads take as well. POSIX: flock on the
// file's folder.
class ProfileGuard {
 public:
  explicit ProfileGuard(const std::string& path);
  ~ProfileGuard();
  ProfileGuard(const ProfileGuard&) = delete;
  ProfileGuard& operator=(const ProfileGuard&) = delete;
};
