#include "platform/posix/profile_text.h"

#include <algorithm>
#include <utility>

#include "platform/ascii_case.h"

namespace {

constexpr std::string_view blanks = " \t\v\f\r";
constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";
constexpr size_t none = std::string_view::npos;

// Behind the line end of the line that holds the place.
size_t NextLine(std::string_view text, size_t place) {
  return std::min(text.find('\n', place), text.size() - 1) + 1;
}

// Where the line of the place begins, a byte order mark aside.
size_t LineBegin(std::string_view text, size_t place) {
  const size_t lineEnd = place == 0 ? none : text.rfind('\n', place - 1);
  if (lineEnd != none) {
    return lineEnd + 1;
  }
  return text.starts_with(byteOrderMark) ? byteOrderMark.size() : 0;
}

}  // namespace

std::string_view TrimBlanks(std::string_view text) {
  const size_t begin = text.find_first_not_of(blanks);
  return begin == none ? std::string_view()
                       : text.substr(begin, text.find_last_not_of(blanks) - begin + 1);
}

// Looks at the lines with a "[" alone: a history has some tens of times as many others.
ProfileText::ProfileText(std::string text) : Text(std::move(text)) {
  const std::string_view all = Text;
  for (size_t bracket = all.find('['); bracket != none;) {
    const size_t begin = LineBegin(all, bracket);
    const size_t next = NextLine(all, bracket);
    const bool isFirst = TrimBlanks(all.substr(begin, bracket - begin)).empty();
    const std::string_view header = all.substr(bracket, next - bracket);
    const size_t close = isFirst ? header.rfind(']') : none;
    if (close != none) {
      const std::string_view name = TrimBlanks(header.substr(1, close - 1));
      const auto nameBegin = static_cast<size_t>(name.data() - all.data());
      Sections.push_back({begin, next, name.empty() ? begin : nameBegin, name.size()});
    }
    bracket = all.find('[', next);
  }
}

std::string_view ProfileText::NameOf(const Section& section) const {
  return std::string_view(Text).substr(section.NameBegin, section.NameLength);
}

// The index of the first section of that name, or none.
size_t ProfileText::FindSection(std::string_view name) const {
  const std::string_view trimmed = TrimBlanks(name);
  const auto isNamed = [&](const Section& section) {
    return section.NameLength == trimmed.size() && EqualsIgnoringCase(NameOf(section), trimmed);
  };
  if (LastFound < Sections.size() && isNamed(Sections[LastFound])) {
    return LastFound;
  }
  const auto found = std::find_if(Sections.begin(), Sections.end(), isNamed);
  if (found == Sections.end()) {
    return none;
  }
  LastFound = static_cast<size_t>(found - Sections.begin());
  return LastFound;
}

size_t ProfileText::EndOf(size_t section) const {
  return section + 1 < Sections.size() ? Sections[section + 1].Header : Text.size();
}

// The value with the blanks around it, as a view into the text; without data if there is no key.
std::string_view ProfileText::ValueIn(size_t section, std::string_view key) const {
  const std::string_view all = Text;
  const size_t end = EndOf(section);
  for (size_t line = Sections[section].Body; line < end; line = NextLine(all, line)) {
    const std::string_view content = all.substr(line, all.find('\n', line) - line);
    const size_t sign = content.find('=');
    if (sign != none && EqualsIgnoringCase(TrimBlanks(content.substr(0, sign)), TrimBlanks(key))) {
      return content.substr(sign + 1);
    }
  }
  return {};
}

std::optional<std::string_view> ProfileText::Find(std::string_view section,
                                                  std::string_view key) const {
  const size_t place = FindSection(section);
  const std::string_view value = place == none ? std::string_view() : ValueIn(place, key);
  return value.data() == nullptr ? std::nullopt : std::optional(TrimBlanks(value));
}

void ProfileText::Set(std::string_view section, std::string_view key, std::string_view value) {
  size_t place = FindSection(section);
  if (place == none) {
    if (!Text.empty() && Text.back() != '\n') {
      Text += '\n';
    }
    const std::string_view name = TrimBlanks(section);
    place = Sections.size();
    Sections.push_back({Text.size(), Text.size() + name.size() + 3, Text.size() + 1, name.size()});
    Text.append("[").append(name).append("]\n");
  }
  const std::string_view old = ValueIn(place, key);
  if (old.data() == nullptr) {
    AddKey(place, key, value);
    return;
  }
  const bool hasCarriageReturn = old.ends_with('\r');
  Replace(static_cast<size_t>(old.data() - Text.data()), old.size() - (hasCarriageReturn ? 1 : 0),
          value);
}

void ProfileText::AddKey(size_t section, std::string_view key, std::string_view value) {
  const std::string_view filled = std::string_view(Text).substr(0, EndOf(section));
  const size_t lastCharacter = filled.find_last_not_of(" \t\v\f\r\n");
  const size_t place = NextLine(filled, lastCharacter);
  std::string line = filled[place - 1] == '\n' ? "" : "\n";
  line.append(key).append("=").append(value).append("\n");
  // What is added behind the last character of the text lies in the section, not behind it.
  Replace(place, 0, line);
}

void ProfileText::Replace(size_t place, size_t length, std::string_view replacement) {
  Text.replace(place, length, replacement);
  const size_t change = replacement.size() - length;  // may wrap, as the sums below do again
  const auto later = std::find_if(Sections.begin(), Sections.end(),
                                  [place](const Section& s) { return s.Header >= place; });
  std::for_each(later, Sections.end(), [change](Section& section) {
    section.Header += change;
    section.Body += change;
    section.NameBegin += change;
  });
}

std::vector<std::string_view> ProfileText::SectionNames() const {
  std::vector<std::string_view> names;
  for (const Section& section : Sections) {
    const std::string_view name = NameOf(section);
    if (const size_t length = std::min(name.find('\0'), name.size()); length > 0) {
      names.push_back(name.substr(0, length));
    }
  }
  return names;
}
