#include <algorithm>

#include "reader/views.h"

static Colour ColourOf(FindingLevel level) {
  return level == FindingLevel::kError     ? Colour::kRed
         : level == FindingLevel::kWarning ? Colour::kYellow
                                           : Colour::kPlain;
}

std::string FindingsText(const FindingList& findings, const ViewOptions& options) {
  size_t codeWidth = 0;
  size_t eventWidth = 0;
  for (const Finding& finding : findings) {
    codeWidth = std::max(codeWidth, ColumnsOf(Printable(finding.Code)));
    eventWidth = std::max(eventWidth, ColumnsOf(Printable(finding.Event)));
  }
  eventWidth = std::min<size_t>(eventWidth, 30);
  std::string text;
  size_t counts[3] = {};
  for (const Finding& finding : findings) {
    ++counts[static_cast<size_t>(finding.Level)];
    text += Painted(PaddedTo(LevelName(finding.Level), 7), ColourOf(finding.Level), options) +
            "  " + PaddedTo(Printable(finding.Code), codeWidth) + "  " +
            (eventWidth > 0 ? PaddedTo(Printable(finding.Event), eventWidth) + "  " : "") +
            Printable(finding.Text) + "\n";
  }
  const auto counted = [&counts](FindingLevel level, const char* name) {
    const size_t count = counts[static_cast<size_t>(level)];
    return std::to_string(count) + " " + name + (count == 1 ? "" : "s");
  };
  return text + counted(FindingLevel::kError, "error") + ", " +
         counted(FindingLevel::kWarning, "warning") + ", " + counted(FindingLevel::kNote, "note") +
         "\n";
}
