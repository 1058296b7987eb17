#pragma once

#include <optional>
#include <set>

#include "fuzz/support.h"
#include "platform/ascii_case.h"

// A profile file as a list of lines, all of them parsed again after each change. Slow and plain, to
// compare ProfileText with; the operations are those of ProfileText.
class ProfileModel {
 public:
  explicit ProfileModel(std::string_view file) {
    std::set<std::string> known;
    std::string section = "\n";  // no section: none has such a name
    for (const std::string& text : Split(file, '\n')) {
      Line& line = Lines.emplace_back(Line{text, section, SectionName(text), {}});
      const size_t sign = text.find('=');
      if (line.Name) {
        const bool isFirst = known.insert(LoweredAscii(*line.Name)).second;
        line.Section = section = isFirst ? LoweredAscii(*line.Name) : "\n";
      } else if (sign != std::string::npos) {
        line.Key = LoweredAscii(Trim(text.substr(0, sign)));
      }
    }
  }

  std::string Text() const {
    std::string text;
    for (const Line& line : Lines) {
      text += line.Text + '\n';
    }
    text.pop_back();  // the last line is what follows the last line end
    return text;
  }

  std::vector<std::string_view> SectionNames() const {
    std::vector<std::string_view> names;
    for (const Line& line : Lines) {
      names.emplace_back(line.Name ? line.Name->c_str() : "");  // to its first NUL
    }
    std::erase(names, "");
    return names;
  }

  std::optional<std::string_view> Find(std::string_view section, std::string_view key) const {
    const size_t index = IndexOf(section, key);
    if (index == Lines.size()) {
      return std::nullopt;
    }
    const std::string_view text = Lines[index].Text;
    return ValueOf(text.substr(text.find('=') + 1));
  }

  void Set(std::string_view section, const std::string& key, const std::string& value) {
    const size_t index = IndexOf(section, key);
    if (index == Lines.size()) {
      Add(std::string(Trim(section)), key + "=" + value);
    } else {
      std::string& text = Lines[index].Text;
      text = text.substr(0, text.find('=') + 1) + value + (text.ends_with('\r') ? "\r" : "");
    }
    *this = ProfileModel(Text());
  }

  // What is read of a text after a "=".
  static std::string_view ValueOf(std::string_view text) {
    text = Trim(text);
    const bool isQuoted = text.size() > 1 && text.front() == text.back() &&
                          (text.front() == '"' || text.front() == '\'');
    return isQuoted ? text.substr(1, text.size() - 2) : text;
  }

 private:
  // Section and Key are in lower case.
  struct Line {
    std::string Text;
    std::string Section;
    std::optional<std::string> Name;  // of the section that the line begins
    std::optional<std::string> Key;
  };

  static std::string_view Trim(std::string_view text) {
    constexpr std::string_view blanks = " \t\n\v\f\r";
    text.remove_prefix(std::min(text.find_first_not_of(blanks), text.size()));
    return text.substr(0, text.find_last_not_of(blanks) + 1);
  }

  std::optional<std::string> SectionName(std::string_view line) const {
    line.remove_prefix(Lines.empty() && line.starts_with("\xEF\xBB\xBF") ? 3 : 0);
    line = Trim(line);
    const size_t close = line.rfind(']');
    const bool isHeader = line.starts_with('[') && close != std::string_view::npos;
    return isHeader ? std::optional(std::string(Trim(line.substr(1, close - 1)))) : std::nullopt;
  }

  // The number of lines if there is no such key.
  size_t IndexOf(std::string_view section, std::string_view key) const {
    const auto found = std::find_if(Lines.begin(), Lines.end(), [&](const Line& line) {
      return line.Section == LoweredAscii(Trim(section)) && line.Key == LoweredAscii(Trim(key));
    });
    return static_cast<size_t>(found - Lines.begin());
  }

  void Add(const std::string& section, std::string text) {
    const auto last = std::find_if(Lines.rbegin(), Lines.rend(), [&](const Line& line) {
      return line.Section == LoweredAscii(section) && !Trim(line.Text).empty();
    });
    auto next = last.base();
    if (last == Lines.rend()) {
      next = Lines.end() - (Lines.back().Text.empty() ? 1 : 0);
      text.insert(0, "[" + section + "]\n");
    }
    Lines.insert(next, {text + (next == Lines.end() ? "\n" : ""), {}, {}, {}});
  }

  std::vector<Line> Lines;
};
