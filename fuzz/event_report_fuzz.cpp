// The report reader: any bytes are a report, in any order of its blocks. Nothing is read beyond the
// text, what is read back is part of it, and its changes are valid UTF-8.

#include "fuzz/support.h"
#include "reader/change.h"
#include "reader/report.h"

static void CheckSnapshots(const Snapshot& before, const Snapshot& after) {
  const auto compare = [](const Snapshot& a, const Snapshot& b) {
    return CompareSnapshots(a, b, TextDecoder(), ChangeDetail::kList);
  };
  const Changes changes = compare(before, after);
  const ChangeCounts& counts = changes.Counts;
  Require(changes.List.size() == counts.Added + counts.Removed + counts.Changed);
  for (const Change& change : changes.List) {
    Require(IsUtf8(change.Name));
  }
  Require(compare(before, before).List.empty());
}

void CheckInput(const std::string& input) {
  ReportFacts facts;
  facts.MayHaveEnded = !input.ends_with('o');
  if (input.starts_with('4')) {
    facts.Identity = "42";
  }
  std::string text = input;
  UnifyLineEnds(text);
  const std::vector<ReportRun> runs = ParseReport(text, facts);
  Require(!runs.empty());
  for (const ReportRun& run : runs) {
    for (const std::string_view piece : run.Messages) {
      Require(piece.empty() || (piece.data() >= text.data() &&
                                piece.data() + piece.size() <= text.data() + text.size()));
    }
    CheckSnapshots(run.Before.value_or(Snapshot()), run.After.value_or(Snapshot()));
  }
}
