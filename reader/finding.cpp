#include "reader/finding.h"

#include <utility>

#include "reader/limits.h"
#include "reader/text_encoding.h"

std::string_view LevelName(FindingLevel level) {
  switch (level) {
    case FindingLevel::kError:
      return "error";
    case FindingLevel::kWarning:
      return "warning";
    default:
      return "note";
  }
}

void FindingList::Add(Finding finding) {
  if (Bytes > kMostBytesOfFindings) {
    return;
  }
  finding.Event = Shortened(finding.Event, kMostBytesOfFindingText);
  finding.Text = Shortened(finding.Text, kMostBytesOfFindingText);
  Bytes += sizeof finding + finding.Event.size() + finding.Text.size();
  List.push_back(std::move(finding));
  if (Bytes > kMostBytesOfFindings) {
    List.push_back({FindingLevel::kError, "damaged", "", "more findings are left out"});
  }
}
