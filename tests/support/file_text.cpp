#include "tests/support/file_text.h"

#include <algorithm>
#include <fstream>
#include <iterator>
#include <string_view>

std::string FileText(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

void WriteFileText(const std::string& path, const std::string& text) {
  std::ofstream(path, std::ios::binary) << text;
}

std::string Golden(const std::string& name) { return FileText(ORX_GOLDEN_FOLDER "/" + name); }

std::string WithoutTimes(const std::string& text) {
  // By hand, as <regex> takes longer to compile than most tests.
  constexpr std::string_view form = "00000000 00:00:00";
  const auto matches = [](char c, char f) { return f == '0' ? c >= '0' && c <= '9' : c == f; };
  std::string result;
  for (size_t at = 0; at < text.size();) {
    const std::string_view part = std::string_view(text).substr(at, form.size());
    const bool isTime = std::equal(part.begin(), part.end(), form.begin(), form.end(), matches);
    result += isTime ? "<time>" : text.substr(at, 1);
    at += isTime ? form.size() : 1;
  }
  return result;
}

std::string Replaced(std::string text, const std::string& old, const std::string& by) {
  for (size_t at = 0; (at = text.find(old, at)) != std::string::npos; at += by.size()) {
    text.replace(at, old.size(), by);
  }
  return text;
}

std::string Repeated(const std::string& text, size_t times) {
  std::string all;
  for (size_t i = 0; i < times; ++i) {
    all += text;
  }
  return all;
}
