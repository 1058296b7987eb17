#pragma once

#include <cstdint>
#include <string>
#include <vector>

// A profile file bound to one file name. It keeps no file open and no value in memory: each
// operation is one complete access (platform/profile_file.h), so that several objects on the same
// file see each other's writes at once.
//
// A line break in a section name or value is stored as one blank; a value is read up to its first
// NUL. A read returns the fallback if the file cannot be read, or if the file, section or key does
// not exist; no error is reported.
class CIniFile {
 public:
  explicit CIniFile(const std::string& path);

  // At most size - 1 bytes of the value, without the blanks and the pair of quotation marks around
  // it.
  std::string ReadString(const std::string& section, const std::string& key,
                         const std::string& fallback, uint32_t size) const;

  // Creates the file, section and key if they do not exist. Always returns 0, even on failure.
  int WriteString(const std::string& section, const std::string& key, const std::string& value);

  // The number that the value begins with, in one of the forms that ReadProfileInt lists; 0 if it
  // begins with none, the fallback if it is empty.
  int32_t ReadInt(const std::string& section, const std::string& key, int32_t fallback) const;

  // The same as WriteString with the number in decimal, but returns false on failure.
  bool WriteInt(const std::string& section, const std::string& key, int32_t value);

  // The section names in file order, as far as they and their ends fit in 10240 bytes; the last
  // one may be cut.
  std::vector<std::string> GetSectionNames() const;

  std::string Path;
};
