#include "reader/report_run.h"

#include <algorithm>
#include <optional>
#include <string>
#include <utility>

#include "reader/lines.h"
#include "reader/report_blocks.h"

namespace {

// The second snapshot of a run and the blocks after it, whole or not.
struct Ending {
  Marks Box;  // its mark and those after it
  const Mark* BoxEnd = nullptr;
  EndBlocks Blocks;
};

class RunReader {
 public:
  RunReader(std::string_view text, size_t begin, Marks marks, const ReportFacts& facts)
      : Text(text), Facts(facts), AllMarks(marks), Cursor(begin) {}

  ReportRun Read() {
    ReadStartAndBefore();
    const std::optional<Ending> ending = Facts.MayHaveEnded ? FindEnding() : std::nullopt;
    const size_t limit = ending ? ending->Box.front().Begin : Text.size();
    if (Run.Before && !BeforeIsWhole) {
      SkipBrokenPart(limit);
    }
    AddMessages(Cursor, ending ? limit : EndOfMessages());
    if (ending) {
      TakeEnding(*ending);
    } else if (Facts.EndTime) {
      Run.IsWhole = false;
    }
    return std::move(Run);
  }

 private:
  bool IsOfEvent(std::string_view boxText, std::string_view words) const {
    return !Identity ||
           (boxText.starts_with(*Identity) && boxText.substr(Identity->size()).starts_with(words));
  }

  void AddMessages(size_t begin, size_t end) {
    if (begin < end) {
      Run.Messages.push_back(Text.substr(begin, end - begin));
    }
  }

  void ReadStartAndBefore() {
    if (Facts.Identity) {
      Identity = *Facts.Identity;
    }
    if (AllMarks.empty() || AllMarks.front().Kind != MarkKind::kStart) {
      Cursor = kStartTitle.starts_with(Text) ? Text.size() : Cursor;
      return;
    }
    AddMessages(Cursor, AllMarks.front().Begin);
    LineReader lines(Text.substr(AllMarks.front().Begin));
    ReadStartBlocks(lines);
    const auto box = std::find_if(AllMarks.begin(), AllMarks.end(), [this](const Mark& mark) {
      return mark.Begin >= Cursor && mark.Kind == MarkKind::kBeforeBox;
    });
    constexpr std::string_view words = " -- Before ";
    Run.IsWhole = box != AllMarks.end() && Run.Computer && box->Begin == Cursor &&
                  IsOfEvent(box->Text, words);
    if (!Run.IsWhole) {
      SkipBrokenBox(lines);
      return;
    }
    const std::string_view action = box->Text.substr(Identity->size() + words.size());
    Run.StartAction = action.substr(0, action.rfind(" Starts "));
    ReadBefore(Marks(box, AllMarks.end()));
  }

  void ReadStartBlocks(LineReader& lines) {
    Run.Start = ReadStart(lines);
    if (Run.Start) {
      Identity = Run.Start->Identity;
      Run.Computer = ReadComputer(lines);
    }
    Cursor = Text.size() - lines.Remaining().size();
  }

  void SkipBrokenBox(LineReader lines) {
    if (lines.Skip(std::string(94, '*')) && lines.Labelled("*  Snapshoot for EventID: ")) {
      lines.Skip('*' + std::string(93, ' '));
    }
    Cursor = Text.size() - lines.Remaining().size();
    SkipBrokenLine();
  }

  // After a block that breaks off, the rest of a line at the end of the text is no message.
  void SkipBrokenLine() { Cursor = Text.find('\n', Cursor) == Text.npos ? Text.size() : Cursor; }

  void ReadBefore(Marks marks) {
    const auto end = std::find_if(marks.begin(), marks.end(), [this](const Mark& mark) {
      return (mark.Kind == MarkKind::kBeforeEnd && IsOfEvent(mark.Text, " Before ")) ||
             IsAfterBox(mark);
    });
    BeforeIsWhole = end != marks.end() && end->Kind == MarkKind::kBeforeEnd;
    const size_t parts = TakeParts(Marks(marks.begin(), end), Run.Before.emplace());
    if (BeforeIsWhole && parts == kSnapshotParts) {
      ClosePart(*Run.Before, end->Begin);
      Cursor = end->End;
    } else {
      Cursor = PartBegin;
      BrokenPart = parts;
      Run.IsWhole = BeforeIsWhole = false;
    }
  }

  // Fills all parts but the last that begins, and returns how many begin.
  size_t TakeParts(Marks marks, Snapshot& snapshot) {
    size_t parts = 0;
    PartBegin = marks.front().End;
    for (const Mark& mark : marks) {
      if (mark.Kind == MarkKind::kHeading && mark.Part == parts) {
        if (parts > 0) {
          snapshot.Parts[parts - 1] = Text.substr(PartBegin, mark.Begin - 1 - PartBegin);
        }
        PartBegin = mark.End;
        ++parts;
      }
    }
    return parts;
  }

  void ClosePart(Snapshot& snapshot, size_t end) const {
    snapshot.Parts.back() = Text.substr(PartBegin, end - PartBegin);
  }

  // Messages follow the part at which the first run broke off: all from the first line on that its
  // tables cannot have.
  void SkipBrokenPart(size_t limit) {
    if (BrokenPart > 0 && Cursor < limit) {
      Cursor += TableLength(Text.substr(Cursor, limit - Cursor), BrokenPart - 1);
    }
    if (IsBrokenHead(Text.substr(Cursor), HeadOfPart(BrokenPart))) {
      Cursor = Text.size();
    }
    SkipBrokenLine();
  }

  // True if the text is the start of a block that begins with the head and breaks off.
  static bool IsBrokenHead(std::string_view text, std::string_view head) {
    return head.starts_with(text) || text.starts_with(head);
  }

  std::optional<Ending> FindEnding() const {
    std::optional<Ending> whole;
    std::optional<Ending> broken;
    std::optional<Ending> earlier;
    for (size_t i = 0; i < AllMarks.size(); ++i) {
      if (AllMarks[i].Begin < Cursor || !IsAfterBox(AllMarks[i])) {
        continue;
      }
      const Ending ending = EndingAt(AllMarks.subspan(i));
      if (IsEndOfFacts(ending)) {
        whole = ending;
      } else if (IsBrokenEndOfFacts(ending)) {
        broken = ending;
      } else if (IsEarlierEndOfFacts(ending)) {
        earlier = ending;
      }
    }
    return whole ? whole : broken ? broken : earlier;
  }

  bool IsAfterBox(const Mark& mark) const {
    return mark.Kind == MarkKind::kAfterBox && IsOfEvent(mark.Text, " -- After ");
  }

  Ending EndingAt(Marks marks) const {
    Ending ending;
    ending.Box = marks;
    for (const Mark& mark : marks.subspan(1)) {
      if (IsAfterBox(mark)) {
        ending.Blocks.Status = EndStatus::kContradicts;
        return ending;
      }
      if (mark.Kind == MarkKind::kAfterEnd && IsOfEvent(mark.Text, " -- After ")) {
        ending.BoxEnd = &mark;
        ending.Blocks = ReadEnd(Text, mark.End);
        return ending;
      }
    }
    ending.Blocks.Status = EndStatus::kBreaksOff;
    ending.Blocks.End = Text.size();
    return ending;
  }

  bool HasStartOfFacts(const Ending& ending) const {
    return !Facts.StartTime || ending.Blocks.Result.StartTime == *Facts.StartTime;
  }

  bool HasEndOfFacts(const Ending& ending) const {
    return !Facts.EndTime || ending.Blocks.Result.EndTime == *Facts.EndTime;
  }

  bool IsEndOfFacts(const Ending& ending) const {
    return ending.Blocks.Status == EndStatus::kWhole && HasStartOfFacts(ending) &&
           HasEndOfFacts(ending);
  }

  // The lines of the result block that are there must not contradict the facts.
  bool IsBrokenEndOfFacts(const Ending& ending) const {
    const ResultBlock& result = ending.Blocks.Result;
    return ending.Blocks.Status == EndStatus::kBreaksOff &&
           (result.StartTime.data() == nullptr || HasStartOfFacts(ending)) &&
           (result.EndTime.data() == nullptr || HasEndOfFacts(ending));
  }

  // A second end finds the folder moved: it changes the time in the history file, and no report.
  bool IsEarlierEndOfFacts(const Ending& ending) const {
    return Facts.IsPlaced && ending.Blocks.Status == EndStatus::kWhole && HasStartOfFacts(ending) &&
           Facts.EndTime && ending.Blocks.Result.EndTime < *Facts.EndTime &&
           ending.Blocks.End == Text.size();
  }

  void TakeEnding(const Ending& ending) {
    const auto boxEnd =
        std::find_if(ending.Box.begin(), ending.Box.end(),
                     [&ending](const Mark& mark) { return &mark == ending.BoxEnd; });
    const size_t parts = TakeParts(Marks(ending.Box.begin(), boxEnd), Run.After.emplace());
    if (ending.BoxEnd != nullptr && parts == kSnapshotParts) {
      ClosePart(*Run.After, ending.BoxEnd->Begin);
    }
    if (ending.Blocks.Status == EndStatus::kWhole) {
      Run.Result = ending.Blocks.Result;
      AddMessages(ending.Blocks.End, Text.size());
    } else {
      Run.IsWhole = false;
    }
  }

  // The second snapshot may break off within its first box, which is no message then.
  size_t EndOfMessages() {
    if (!Facts.MayHaveEnded) {
      return Text.size();
    }
    const std::string head =
        HeadOfAfterBox() + std::string(Identity.value_or("")) + (Identity ? " -- After " : "");
    size_t end = Text.size();
    size_t begin = end;
    for (int lines = 0; lines < 5 && begin > Cursor; ++lines) {
      const size_t lineEnd = begin > 1 ? Text.rfind('\n', begin - 2) : Text.npos;
      begin = lineEnd == Text.npos ? 0 : lineEnd + 1;
      const std::string_view tail = Text.substr(begin);
      if (begin >= Cursor && IsBrokenHead(tail, head)) {
        end = begin;
      }
    }
    Run.IsWhole = Run.IsWhole && end == Text.size();
    return end;
  }

  std::string_view Text;
  const ReportFacts& Facts;
  Marks AllMarks;
  ReportRun Run;
  std::optional<std::string_view> Identity;
  bool BeforeIsWhole = false;
  size_t BrokenPart = 0;
  size_t PartBegin = 0;
  size_t Cursor = 0;  // all before it belongs to a block
};

}  // namespace

ReportRun ReadRun(std::string_view text, size_t begin, Marks marks, const ReportFacts& facts) {
  return RunReader(text, begin, marks, facts).Read();
}
