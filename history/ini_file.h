#pragma once

#include <cstdint>
#include <string>
#include <vector>

// A profile file bound to one file name. It keeps no file open and no value in memory: each
// operation is one complete access (platform/profile_file.h), so that objects on the same file see
// each other's writes at once.
//
// A line break in a section name or value becomes one blank on its way into the file; a value ends
// at its first NUL. No failure is told: a missing file, section or key reads as the default.
class CIniFile {
 public:
  explicit CIniFile(const std::string& path);

  // At most size - 1 bytes of the value, without blanks and quotation marks around it.
  std::string ReadString(const std::string& section, const std::string& key,
                         const std::string& fallback, uint32_t size) const;

  // Always 0, whatever happened.
  int WriteString(const std::string& section, const std::string& key, const std::string& value);

  int32_t ReadInt(const std::string& section, const std::string& key, int32_t fallback) const;

  // The one write that tells whether it worked.
  bool WriteInt(const std::string& section, const std::string& key, int32_t value);

  // The section names in file order, as far as they and their ends fit in 10240 bytes; the last
  // one may be cut short.
  std::vector<std::string> GetSectionNames() const;

  std::string Path;
};
