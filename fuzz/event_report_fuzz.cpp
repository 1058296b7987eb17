// The report reader: any bytes are a report, in any order of its blocks. Nothing is read beyond the
// text, what is read back is part of it, and its changes are valid UTF-8.

#include <string>

#include "fuzz/support.h"
#include "reader/change.h"
#include "reader/report.h"
#include "reader/text_encoding.h"

namespace {

void CheckSnapshots(const ReportRun& run) {
  const Snapshot none = {};
  const Changes changes = CompareSnapshots(run.Before.value_or(none), run.After.value_or(none),
                                           TextDecoder(), ChangeDetail::kList);
  const ChangeCounts& counts = changes.Counts;
  Require(changes.List.size() == counts.Added + counts.Removed + counts.Changed);
  for (const Change& change : changes.List) {
    Require(IsUtf8(change.Name));
  }
  const Snapshot& whole = run.Before.value_or(none);
  Require(CompareSnapshots(whole, whole, TextDecoder(), ChangeDetail::kList).List.empty());
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  std::string text(reinterpret_cast<const char*>(data), size);
  ReportFacts facts;
  facts.MayHaveEnded = !text.ends_with('o');
  if (text.starts_with('4')) {
    facts.Identity = "42";
  }
  UnifyLineEnds(text);
  const std::vector<ReportRun> runs = ParseReport(text, facts);
  Require(!runs.empty());
  for (const ReportRun& run : runs) {
    for (const std::string_view piece : run.Messages) {
      Require(piece.empty() || (piece.data() >= text.data() &&
                                piece.data() + piece.size() <= text.data() + text.size()));
    }
    CheckSnapshots(run);
  }
  return 0;
}
