#include "tests/support/file_text.h"

#include <fstream>
#include <iterator>
#include <regex>

std::string FileText(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

void WriteFileText(const std::string& path, const std::string& text) {
  std::ofstream(path, std::ios::binary) << text;
}

std::string Golden(const std::string& name) { return FileText(ORX_GOLDEN_FOLDER "/" + name); }

std::string WithoutTimes(const std::string& text) {
  return std::regex_replace(text, std::regex("[0-9]{8} [0-9]{2}:[0-9]{2}:[0-9]{2}"), "<time>");
}

std::string Replaced(std::string text, const std::string& old, const std::string& by) {
  for (size_t at = 0; (at = text.find(old, at)) != std::string::npos; at += by.size()) {
    text.replace(at, old.size(), by);
  }
  return text;
}
