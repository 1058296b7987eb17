#include "reader/report_marks.h"

#include <algorithm>
#include <array>
#include <optional>
#include <string>

#include "reader/limits.h"
#include "reader/snapshot.h"

namespace {

const std::string starsLine = std::string(94, '*') + '\n';
const std::string blankLine = '*' + std::string(93, ' ') + '\n';

struct BoxForm {
  MarkKind Kind;
  std::string Head;
  std::string Tail;
};

const std::array<BoxForm, 4> boxForms = {{
    {MarkKind::kBeforeBox, "*  Snapshoot for EventID: ", " Starts \n" + blankLine},
    {MarkKind::kBeforeEnd, "* End of Snapshoot for EventID: ", " Starts  \n"},
    {MarkKind::kAfterBox, blankLine + "*  Snapshoot for EventID: ", " Completed \n" + blankLine},
    {MarkKind::kAfterEnd, "*End of Snapshoot for EventID: ", " Completed \n"},
}};

constexpr std::array<std::string_view, kSnapshotParts> headings = {
    "1) User Group & User Information:\n", "2) Software Installed on the machine:\n",
    "3) Current Running Processes:\n",     "4) Services & Service Status:\n",
    "5) ORX Products Installed:\n",        "6) ORX ODBC Driver Info:\n"};

// Nothing if the line of stars at the offset does not begin a box.
std::optional<Mark> BoxAt(std::string_view text, size_t offset) {
  const size_t body = offset + starsLine.size();
  const size_t bodyEnd = text.find('\n' + starsLine, body);
  if (bodyEnd == text.npos) {
    return std::nullopt;
  }
  const std::string_view lines = text.substr(body, bodyEnd + 1 - body);
  for (const BoxForm& form : boxForms) {
    if (lines.starts_with(form.Head) && lines.ends_with(form.Tail)) {
      return Mark{form.Kind, offset, bodyEnd + 1 + starsLine.size(), 0,
                  lines.substr(form.Head.size())};
    }
  }
  return std::nullopt;
}

std::optional<Mark> HeadingAt(std::string_view text, size_t offset) {
  const auto part = static_cast<size_t>(text[offset] - '1');
  const std::string_view rest = text.substr(offset);
  if (part >= headings.size() || !rest.starts_with(headings[part]) || offset < 2 ||
      text[offset - 2] != '\n') {
    return std::nullopt;
  }
  return Mark{MarkKind::kHeading, offset, offset + headings[part].size(), part, {}};
}

std::optional<Mark> MarkAt(std::string_view text, size_t offset) {
  const std::string_view rest = text.substr(offset);
  switch (rest.front()) {
    case '-':
      return rest.starts_with(kStartTitle)
                 ? std::optional(Mark{MarkKind::kStart, offset, offset + kStartTitle.size(), 0, {}})
                 : std::nullopt;
    case '*':
      return rest.starts_with(starsLine) ? BoxAt(text, offset) : std::nullopt;
    default:
      return HeadingAt(text, offset);
  }
}

}  // namespace

std::vector<Mark> FindMarks(std::string_view text) {
  std::vector<Mark> marks;
  for (size_t offset = 0; offset < text.size() && marks.size() < kMostMarks;) {
    const std::optional<Mark> mark = MarkAt(text, offset);
    if (mark) {
      marks.push_back(*mark);
    }
    // A box ends with a line feed; so does what is before any other mark's next line.
    const size_t end = text.find('\n', mark ? mark->End - 1 : offset);
    offset = end == text.npos ? text.size() : end + 1;
  }
  return marks;
}

std::string HeadOfAfterBox() { return starsLine + boxForms[2].Head; }

std::string HeadOfPart(size_t part) {
  return part < headings.size() ? '\n' + std::string(headings[part]) : starsLine + boxForms[1].Head;
}
