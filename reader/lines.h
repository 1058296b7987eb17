#pragma once

#include <initializer_list>
#include <optional>
#include <string>
#include <string_view>

// Reads a text line by line. A line ends with a line feed; what follows the last one is no line.
class LineReader {
 public:
  explicit LineReader(std::string_view text) : Rest(text) {}

  std::optional<std::string_view> Next() {
    const size_t end = Rest.find('\n');
    if (end == std::string_view::npos) {
      return std::nullopt;
    }
    const std::string_view line = Rest.substr(0, end);
    Rest.remove_prefix(end + 1);
    return line;
  }

  // Skips the next line if it is this one; else false, and nothing is skipped.
  bool Skip(std::string_view line) {
    const bool isNext =
        Rest.size() > line.size() && Rest[line.size()] == '\n' && Rest.starts_with(line);
    if (isNext) {
      Rest.remove_prefix(line.size() + 1);
    }
    return isNext;
  }

  // Skips these lines in their order, up to the first that is not there: false then.
  bool SkipAll(std::initializer_list<std::string_view> lines) {
    for (const std::string_view line : lines) {
      if (!Skip(line)) {
        return false;
      }
    }
    return true;
  }

  // The rest of the next line if it begins with the label.
  std::optional<std::string_view> Labelled(std::string_view label) {
    if (!Rest.starts_with(label)) {
      return std::nullopt;
    }
    const std::optional<std::string_view> line = Next();
    return line ? std::optional(line->substr(label.size())) : std::nullopt;
  }

  bool AtEnd() const { return Rest.empty(); }
  std::string_view Remaining() const { return Rest; }

 private:
  std::string_view Rest;
};

// A rule of at most 185 characters.
inline std::string_view Dashes(size_t length) {
  static const std::string longest(185, '-');
  return std::string_view(longest).substr(0, length);
}
