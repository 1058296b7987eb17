#pragma once

#include <chrono>
#include <cstdint>
#include <string>

// Profile files: sections in square brackets, and in each section lines of key=value. Names compare
// without regard to case; sections and keys keep the order in which they were first written.
//
// Every operation is one complete access to the named file: what one process writes, the next read
// of any process sees. No argument may contain a line break or a NUL.
//
// A write replaces the file in one step, so that a reader never sees half of it. The
// temporary file is in the same folder, its name begins with a dot, and it can be read by nobody
// who may not read the file itself; the new file has the permissions of the old one.
// Windows: the system's profile calls; to write, they change a copy, which then replaces the file.
// A sharing or lock violation is waited out, up to half a second for each access. If another
// program keeps the file open without sharing its deletion, but lets others write, the new text is
// written into the file itself.
// POSIX: our own reader and writer of the format, which parses a file once for each change of it.

// The value of a key: at most size - 1 bytes of it, without the blanks around it and without one
// pair of quotation marks, double or single, that encloses it. The fallback, cut in the same way,
// if the file, the section or the key does not exist or the file cannot be read. The smallest size
// is 1; 0 counts as 1. Windows: GetPrivateProfileStringA.
std::string ReadProfileValue(const std::string& path, const std::string& section,
                             const std::string& key, const std::string& fallback, uint32_t size);

// Sets a key and creates the file, section and key that do not exist, but no folder. False if the
// file cannot be read or written, or could not be read earlier under the same guard; it is then as
// it was. Under a guard true means that the guard's end will write it.
// Windows: WritePrivateProfileStringA.
bool WriteProfileValue(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value);

// The integer that a value begins with: blanks, a plus or minus sign or none, and decimal digits,
// or hexadecimal ones after "0x", octal after "0o", binary after "0b". Of a number of more
// than 32 bits the lowest 32. 0 if there is no digit. The fallback if the value is empty, does not
// exist or cannot be read. Windows: GetPrivateProfileIntA.
int32_t ReadProfileInt(const std::string& path, const std::string& section, const std::string& key,
                       int32_t fallback);

// The names of all sections in file order, each followed by a NUL, and one more NUL, together at
// most size bytes. Names that do not fit are left out, and the last one may be cut; the result ends
// with two NULs all the same. Only two NULs if there is no section, or no file that can be read.
// The smallest size is 2; less counts as 2. Windows: GetPrivateProfileSectionNamesA.
std::string ReadProfileSectionNames(const std::string& path, uint32_t size);

// While a guard exists, no other process changes the profile file or has a guard of a file in the
// same folder. Guards nest, of one file or of several; the system frees those of a process that
// ends.
//
// A write under a guard is seen by this process at once. When the outermost guard ends, each file
// that was changed is replaced once, with all that was written to it; if that fails, with nothing.
//
// A guard waits for other processes, but all guards of this process together at most ten seconds.
// After that each takes the lock only if it is free. Without the lock this process may undo a
// change that another one makes at the same time. The same holds on a file system without
// locks, and for a folder that does not exist.
// Windows: a named mutex that all sessions share, which reads take as well. POSIX: flock on the
// folder.
class ProfileGuard {
 public:
  explicit ProfileGuard(const std::string& path);
  ~ProfileGuard();
  ProfileGuard(const ProfileGuard&) = delete;
  ProfileGuard& operator=(const ProfileGuard&) = delete;
};

// Sets the time that the guards of this process may wait from now on, all together.
void LimitProfileLockTime(std::chrono::milliseconds time);
