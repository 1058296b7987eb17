#include "history/ini_file.h"

#include "platform/profile_file.h"

// A line break would begin another line of the file.
static std::string OnOneLine(const std::string& text) {
  std::string line;
  line.reserve(text.size());
  for (size_t i = 0; i < text.size(); ++i) {
    const bool isPair = text[i] == '\r' && i + 1 < text.size() && text[i + 1] == '\n';
    if (isPair) {
      continue;
    }
    line += text[i] == '\r' || text[i] == '\n' ? ' ' : text[i];
  }
  return line;
}

CIniFile::CIniFile(const std::string& path) : Path(path) {}

std::string CIniFile::ReadString(const std::string& section, const std::string& key,
                                 const std::string& fallback, uint32_t size) const {
  const std::string value = ReadProfileValue(Path, OnOneLine(section), key, fallback, size);
  return value.substr(0, value.find('\0'));
}

int CIniFile::WriteString(const std::string& section, const std::string& key,
                          const std::string& value) {
  WriteProfileValue(Path, OnOneLine(section), key, OnOneLine(value));
  return 0;
}

int32_t CIniFile::ReadInt(const std::string& section, const std::string& key,
                          int32_t fallback) const {
  return ReadProfileInt(Path, OnOneLine(section), key, fallback);
}

bool CIniFile::WriteInt(const std::string& section, const std::string& key, int32_t value) {
  return WriteProfileValue(Path, OnOneLine(section), key, std::to_string(value));
}

std::vector<std::string> CIniFile::GetSectionNames() const {
  const std::string buffer = ReadProfileSectionNames(Path, 0x2800);
  std::vector<std::string> names;
  for (size_t offset = 0; offset < buffer.size() && buffer[offset] != '\0';) {
    names.emplace_back(buffer.c_str() + offset);
    offset += names.back().size() + 1;
  }
  return names;
}
