#include "reader/report.h"

#include <algorithm>

#include "reader/limits.h"
#include "reader/report_blocks.h"
#include "reader/report_run.h"

// The start of each run, at most up to the one of the facts: a start at which the history file had
// the time of that start already is a message.
static std::vector<size_t> FindStarts(std::string_view text, Marks marks, const ReportFacts& facts,
                                      bool& isCut) {
  std::vector<size_t> starts;
  std::optional<std::string_view> identity;
  for (size_t i = 0; i < marks.size(); ++i) {
    if (marks[i].Kind != MarkKind::kStart) {
      continue;
    }
    LineReader lines(text.substr(marks[i].Begin));
    const auto block = ReadStart(lines);
    if (!block && !starts.empty()) {
      continue;
    }
    if (identity && block->Identity != *identity) {
      continue;
    }
    starts.push_back(i);
    if (starts.size() > kMostStarts) {
      break;
    }
    if (!block || !facts.StartTime || block->Time >= *facts.StartTime) {
      return starts;
    }
    identity = block->Identity;
  }
  // No start matches the facts, so the further ones cannot be distinguished from messages.
  isCut = starts.size() > kMostStarts;
  starts.erase(starts.begin() + std::min<ptrdiff_t>(1, std::ssize(starts)), starts.end());
  return starts;
}

// Without facts, the last end says when its run started.
static std::optional<std::string> StartTimeOfEnd(std::string_view text, Marks marks) {
  for (size_t i = marks.size(); i > 0; --i) {
    if (marks[i - 1].Kind == MarkKind::kAfterEnd) {
      const EndBlocks blocks = ReadEnd(text, marks[i - 1].End);
      if (blocks.Status == EndStatus::kWhole) {
        return std::string(blocks.Result.StartTime);
      }
    }
  }
  return std::nullopt;
}

std::vector<ReportRun> ParseReport(std::string_view text, const ReportFacts& facts) {
  const std::vector<Mark> marks = FindMarks(text);
  ReportFacts known = facts;
  if (!known.StartTime) {
    known.StartTime = StartTimeOfEnd(text, marks);
  }
  bool isCut = false;
  const std::vector<size_t> starts = FindStarts(text, marks, known, isCut);
  ReportFacts unknown;
  unknown.Identity = facts.Identity;
  std::vector<ReportRun> runs;
  const size_t count = std::max<size_t>(starts.size(), 1);
  for (size_t i = 0; i < count; ++i) {
    const bool isLast = i + 1 == count;
    const size_t firstMark = starts.empty() ? 0 : starts[i];
    const size_t endMark = isLast ? marks.size() : starts[i + 1];
    const size_t begin = i == 0 ? 0 : marks[firstMark].Begin;
    const size_t end = isLast ? text.size() : marks[endMark].Begin;
    runs.push_back(ReadRun(text.substr(0, end), begin,
                           Marks(marks).subspan(firstMark, endMark - firstMark),
                           isLast ? known : unknown));
  }
  if (isCut || marks.size() >= kMostMarks) {
    runs.back().IsWhole = false;
  }
  return runs;
}

void UnifyLineEnds(std::string& text) {
  size_t kept = text.find("\r\n");
  if (kept == text.npos) {
    return;
  }
  for (size_t i = kept; i < text.size(); ++i) {
    if (text[i] != '\r' || i + 1 == text.size() || text[i + 1] != '\n') {
      text[kept++] = text[i];
    }
  }
  text.resize(kept);
}
