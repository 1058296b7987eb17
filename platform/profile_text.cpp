#include "platform/profile_text.h"

#include <algorithm>
#include <utility>

#include "platform/ascii_case.h"

namespace {

constexpr std::string_view blanks = " \t\v\f\r";
constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";
constexpr size_t none = std::string_view::npos;

std::string_view TrimBlanks(std::string_view text) {
  const size_t begin = text.find_first_not_of(blanks);
  return begin == none ? std::string_view()
                       : text.substr(begin, text.find_last_not_of(blanks) - begin + 1);
}

std::string_view WithoutQuotes(std::string_view value) {
  const bool isQuoted = value.size() >= 2 && value.front() == value.back() &&
                        (value.front() == '"' || value.front() == '\'');
  return isQuoted ? value.substr(1, value.size() - 2) : value;
}

std::string_view CleanValue(std::string_view raw) { return WithoutQuotes(TrimBlanks(raw)); }

// The offset after the end of the line that contains this offset.
size_t NextLine(std::string_view text, size_t offset) {
  return std::min(text.find('\n', offset), text.size() - 1) + 1;
}

// The offset where that line begins, after a byte order mark.
size_t LineBegin(std::string_view text, size_t offset) {
  const size_t lineEnd = offset == 0 ? none : text.rfind('\n', offset - 1);
  if (lineEnd != none) {
    return lineEnd + 1;
  }
  return text.starts_with(byteOrderMark) ? byteOrderMark.size() : 0;
}

// Calls visit(key, raw value) for each line with a "=" in the range until it returns true.
template <typename Visit>
void VisitLines(std::string_view text, size_t begin, size_t end, Visit visit) {
  for (size_t line = begin; line < end; line = NextLine(text, line)) {
    const std::string_view content = text.substr(line, text.find('\n', line) - line);
    const size_t sign = content.find('=');
    if (sign != none && visit(TrimBlanks(content.substr(0, sign)), content.substr(sign + 1))) {
      return;
    }
  }
}

}  // namespace

// Looks only at lines with a "[": there are tens of times as many others.
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

std::string_view ProfileText::NameOf(size_t section) const {
  return std::string_view(Text).substr(Sections[section].NameBegin, Sections[section].NameLength);
}

// The index of the first section of that name, or none.
size_t ProfileText::FindSection(std::string_view name) const {
  const std::string_view trimmed = TrimBlanks(name);
  const auto isNamed = [&](size_t section) {
    return Sections[section].NameLength == trimmed.size() &&
           EqualsIgnoringCase(NameOf(section), trimmed);
  };
  if (LastFound < Sections.size() && isNamed(LastFound)) {
    return LastFound;
  }
  for (size_t i = 0; i < Sections.size(); ++i) {
    if (isNamed(i)) {
      LastFound = i;
      return i;
    }
  }
  return none;
}

size_t ProfileText::EndOf(size_t section) const {
  return section + 1 < Sections.size() ? Sections[section + 1].Header : Text.size();
}

// The text after the "=", with blanks and quotation marks; without data if there is no such key.
std::string_view ProfileText::RawValue(size_t section, std::string_view key) const {
  std::string_view found;
  const std::string_view wanted = TrimBlanks(key);
  VisitLines(Text, Sections[section].Body, EndOf(section),
             [&](std::string_view name, std::string_view value) {
               const bool isFound = EqualsIgnoringCase(name, wanted);
               found = isFound ? value : found;
               return isFound;
             });
  return found;
}

std::optional<std::string_view> ProfileText::Find(std::string_view section,
                                                  std::string_view key) const {
  const size_t index = FindSection(section);
  const std::string_view value = index == none ? std::string_view() : RawValue(index, key);
  return value.data() == nullptr ? std::nullopt : std::optional(CleanValue(value));
}

std::vector<ProfileLine> ProfileText::LinesOf(size_t section) const {
  std::vector<ProfileLine> lines;
  VisitLines(Text, Sections[section].Body, EndOf(section),
             [&](std::string_view key, std::string_view value) {
               lines.push_back({key, CleanValue(value)});
               return false;
             });
  return lines;
}

void ProfileText::Set(std::string_view section, std::string_view key, std::string_view value) {
  size_t index = FindSection(section);
  if (index == none) {
    if (!Text.empty() && Text.back() != '\n') {
      Text += '\n';
    }
    const std::string_view name = TrimBlanks(section);
    index = Sections.size();
    Sections.push_back({Text.size(), Text.size() + name.size() + 3, Text.size() + 1, name.size()});
    Text.append("[").append(name).append("]\n");
    LastFound = index;
  }
  const std::string_view old = RawValue(index, key);
  if (old.data() == nullptr) {
    AddKey(index, key, value);
    return;
  }
  const bool hasCarriageReturn = old.ends_with('\r');
  Replace(static_cast<size_t>(old.data() - Text.data()), old.size() - (hasCarriageReturn ? 1 : 0),
          value);
}

void ProfileText::AddKey(size_t section, std::string_view key, std::string_view value) {
  const std::string_view filled = std::string_view(Text).substr(0, EndOf(section));
  const size_t lastCharacter = filled.find_last_not_of(" \t\v\f\r\n");
  const size_t offset = NextLine(filled, lastCharacter);
  std::string line = filled[offset - 1] == '\n' ? "" : "\n";
  line.append(key).append("=").append(value).append("\n");
  Replace(offset, 0, line);
}

void ProfileText::Replace(size_t offset, size_t length, std::string_view replacement) {
  Text.replace(offset, length, replacement);
  const size_t change = replacement.size() - length;  // may wrap, as the sums below do again
  const auto later = std::find_if(Sections.begin(), Sections.end(),
                                  [offset](const Section& s) { return s.Header >= offset; });
  std::for_each(later, Sections.end(), [change](Section& section) {
    section.Header += change;
    section.Body += change;
    section.NameBegin += change;
  });
}

std::vector<std::string_view> ProfileText::SectionNames() const {
  std::vector<std::string_view> names;
  for (size_t i = 0; i < Sections.size(); ++i) {
    const std::string_view name = NameOf(i);
    if (const size_t length = std::min(name.find('\0'), name.size()); length > 0) {
      names.push_back(name.substr(0, length));
    }
  }
  return names;
}
