#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

// The text of a profile file, with the places of its sections. Only what Set changes is changed:
// blank lines, comments, damaged lines and line ends of a file edited by hand stay as they are.
//
// A line whose first character is "[" and that holds a "]" begins a section, and the last "]" ends
// its name. A key is what stands before the first "=" of a line. Blanks around either do not count,
// nor does the case of the letters A to Z. Of two sections or keys with one name the first counts.
class ProfileText {
 public:
  explicit ProfileText(std::string text);

  // The value without the blanks around it; nothing without the section or the key. It is good
  // until the next Set.
  std::optional<std::string_view> Find(std::string_view section, std::string_view key) const;

  // Replaces the value in its place, or adds the key behind the last line of its section that is
  // not blank, or both at the end of the text.
  void Set(std::string_view section, std::string_view key, std::string_view value);

  // In the order of the text; names without a character are left out. Good until the next Set.
  std::vector<std::string_view> SectionNames() const;

  const std::string& Get() const { return Text; }

 private:
  struct Section {
    size_t Header;  // where its header line begins
    size_t Body;    // where the line below begins
    size_t NameBegin;
    size_t NameLength;
  };

  size_t FindSection(std::string_view name) const;
  size_t EndOf(size_t section) const;
  std::string_view NameOf(const Section& section) const;
  std::string_view ValueIn(size_t section, std::string_view key) const;
  void AddKey(size_t section, std::string_view key, std::string_view value);
  void Replace(size_t place, size_t length, std::string_view replacement);

  std::string Text;
  std::vector<Section> Sections;
  mutable size_t LastFound = 0;  // most questions are about the section of the one before
};

// The text without the white space at its two ends.
std::string_view TrimBlanks(std::string_view text);
