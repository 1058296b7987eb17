#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

// One line "key=value" of a profile file, as views into its text.
struct ProfileLine {
  std::string_view Key;    // without the blanks around it
  std::string_view Value;  // without the blanks around it, then without one pair of quotation marks
};

// The text of a profile file and the offsets of its sections. There is no limit on their number or
// on the length of a name or value. Plain C++ on every system: it makes no system calls.
//
// A line whose first character is "[" and that has a "]" begins a section; the last "]" ends its
// name. A key is the text before the first "=" of a line. Blanks around names, keys and values do
// not count, nor does the case of the letters A to Z. If two sections, or two keys of one section,
// have the same name, the first one counts. A byte order mark (UTF-8) at the start is skipped.
//
// Set changes only the named key: blank lines, comments, damaged lines and line ends of a file
// edited by hand stay as they are.
class ProfileText {
 public:
  explicit ProfileText(std::string text);

  // The value of a key, as ProfileLine has it; nothing without the section or the key. Valid until
  // the next Set, like every view that the functions below return.
  std::optional<std::string_view> Find(std::string_view section, std::string_view key) const;

  // Replaces the value of a key. A new key is added after the last line of its section that is not
  // blank, a new section at the end of the text.
  void Set(std::string_view section, std::string_view key, std::string_view value);

  // All sections in the order of the text, those without a name or with the name of an earlier one
  // too. Lines before the first section belong to none.
  size_t SectionCount() const { return Sections.size(); }
  std::string_view NameOf(size_t section) const;

  // The lines of a section that have a "=", in the order of the text.
  std::vector<ProfileLine> LinesOf(size_t section) const;

  // The names of the sections, each up to its first NUL; empty ones are left out.
  std::vector<std::string_view> SectionNames() const;

  const std::string& Get() const { return Text; }

 private:
  struct Section {
    size_t Header;  // offset of the header line
    size_t Body;    // offset of the line after it
    size_t NameBegin;
    size_t NameLength;
  };

  size_t FindSection(std::string_view name) const;
  size_t EndOf(size_t section) const;
  std::string_view RawValue(size_t section, std::string_view key) const;
  void AddKey(size_t section, std::string_view key, std::string_view value);
  void Replace(size_t offset, size_t length, std::string_view replacement);

  std::string Text;
  std::vector<Section> Sections;
  mutable size_t LastFound = 0;  // most calls name the same section as the one before
};
