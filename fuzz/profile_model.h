#pragma once

#include <algorithm>
#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ascii_case.h"

// A profile file as a list of lines, each parsed again for each question. Slow and plain, to
// compare ProfileText with; the operations are those of ProfileText.
class ProfileModel {
 public:
  explicit ProfileModel(std::string_view text) {
    while (!text.empty()) {
      const size_t length = std::min(text.find('\n'), text.size() - 1) + 1;
      Lines.emplace_back(text.substr(0, length));
      text.remove_prefix(length);
    }
  }

  std::string Text() const {
    std::string text;
    for (const std::string& line : Lines) {
      text += line;
    }
    return text;
  }

  std::vector<std::string_view> SectionNames() const {
    std::vector<std::string_view> names;
    for (size_t line = 0; line < Lines.size(); ++line) {
      const std::string_view name = SectionAt(line).value_or("");
      if (!name.empty() && name.front() != '\0') {
        names.push_back(name.substr(0, name.find('\0')));
      }
    }
    return names;
  }

  std::optional<std::string_view> Find(std::string_view section, std::string_view key) const {
    const size_t line = LineOf(section, key);
    if (line == Lines.size()) {
      return std::nullopt;
    }
    return ValueOf(std::string_view(Lines[line]).substr(Lines[line].find('=') + 1));
  }

  void Set(const std::string& section, const std::string& key, const std::string& value) {
    const size_t line = LineOf(section, key);
    if (line != Lines.size()) {
      Replace(Lines[line], value);
      return;
    }
    if (HeaderOf(section) == Lines.size()) {
      AddAt(Lines.size(), "[" + std::string(Trim(section)) + "]\n");
    }
    size_t place = EndOf(HeaderOf(section));
    while (Trim(Lines[place - 1]).empty()) {
      --place;
    }
    AddAt(place, key + "=" + value + "\n");
  }

  static std::string_view Trim(std::string_view text) {
    const auto isBlank = [](char c) { return c == ' ' || (c >= '\t' && c <= '\r'); };
    while (!text.empty() && isBlank(text.front())) {
      text.remove_prefix(1);
    }
    while (!text.empty() && isBlank(text.back())) {
      text.remove_suffix(1);
    }
    return text;
  }

  // What is read of a text after a "=".
  static std::string_view ValueOf(std::string_view text) {
    text = Trim(text);
    const bool isQuoted = text.size() > 1 && text.front() == text.back() &&
                          (text.front() == '"' || text.front() == '\'');
    return isQuoted ? text.substr(1, text.size() - 2) : text;
  }

 private:
  // The name of the section that the line begins, if it begins one.
  std::optional<std::string_view> SectionAt(size_t line) const {
    std::string_view text = Lines[line];
    text.remove_prefix(line == 0 && text.starts_with("\xEF\xBB\xBF") ? 3 : 0);
    text = Trim(text);
    const size_t close = text.rfind(']');
    const bool isHeader = text.starts_with('[') && close != std::string_view::npos;
    return isHeader ? std::optional(Trim(text.substr(1, close - 1))) : std::nullopt;
  }

  // The next three return a line's index, or the number of lines if there is no such line.
  size_t HeaderOf(std::string_view section) const {
    size_t line = 0;
    while (line < Lines.size()) {
      const std::optional<std::string_view> name = SectionAt(line);
      if (name && EqualsIgnoringCase(*name, Trim(section))) {
        break;
      }
      ++line;
    }
    return line;
  }

  size_t EndOf(size_t header) const {
    size_t line = std::min(header + 1, Lines.size());
    while (line < Lines.size() && !SectionAt(line)) {
      ++line;
    }
    return line;
  }

  size_t LineOf(std::string_view section, std::string_view key) const {
    const size_t header = HeaderOf(section);
    const size_t end = EndOf(header);
    for (size_t line = header + 1; line < end; ++line) {
      const std::string_view text = Lines[line];
      const size_t sign = text.find('=');
      if (sign != std::string_view::npos &&
          EqualsIgnoringCase(Trim(text.substr(0, sign)), Trim(key))) {
        return line;
      }
    }
    return Lines.size();
  }

  static void Replace(std::string& line, const std::string& value) {
    const size_t begin = line.find('=') + 1;
    size_t end = line.size() - (line.ends_with('\n') ? 1 : 0);
    end -= end > begin && line[end - 1] == '\r' ? 1 : 0;
    line.replace(begin, end - begin, value);
  }

  void AddAt(size_t place, const std::string& line) {
    if (place > 0 && !Lines[place - 1].ends_with('\n')) {
      Lines[place - 1] += '\n';
    }
    Lines.insert(Lines.begin() + static_cast<ptrdiff_t>(place), line);
  }

  std::vector<std::string> Lines;
};
