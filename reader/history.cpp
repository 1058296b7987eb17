#include "reader/history.h"

#include <algorithm>
#include <string>
#include <unordered_set>
#include <utility>

#include "platform/ascii_case.h"
#include "platform/profile_text.h"
#include "reader/event_facts.h"
#include "reader/event_section.h"
#include "reader/history_files.h"
#include "reader/limits.h"
#include "reader/report.h"

namespace {

const std::string reportName = "ORXInstallEvent.Log";

std::optional<std::string> IfNotEmpty(std::string_view text) {
  return text.empty() ? std::nullopt : std::optional(std::string(text));
}

constexpr const char* tooManyEvents =
    "left out, like others: the history has more than 40,000 events";

class HistoryReader {
 public:
  HistoryReader(Source& source, const TextDecoder& decoder, Detail detail,
                const std::optional<std::string>& identity)
      : From(source), Decoder(decoder), Depth(detail), Identity(identity), Files(source, decoder) {}

  History Read() {
    Result.Source = From.Name;
    Result.WasReported = Files.Find("Summary.txt").has_value();
    ReadHistoryFile();
    ReadOrphans();
    std::stable_sort(Result.Events.begin(), Result.Events.end(), IsBefore);
    return std::move(Result);
  }

 private:
  static bool IsBefore(const Event& a, const Event& b) {
    const auto key = [](const Event& event) {
      return std::pair(!event.Started, event.Started ? event.Started : event.Ended);
    };
    return key(a) < key(b);
  }

  // A limit is reported once, with the first event that is beyond it.
  void ReportLimit(const char* text, const std::string& event = "") {
    if (ReportedLimits.insert(text).second) {
      From.Findings.Add({FindingLevel::kError, "damaged", event, text});
    }
  }

  void ReadHistoryFile() {
    const std::optional<size_t> file = Files.FindIgnoringCase("History.ini");
    std::optional<std::string> bytes =
        file ? From.Read(*file, kMostBytesOfHistoryFile) : std::nullopt;
    if (!bytes) {
      return;
    }
    Result.HasHistoryFile = true;
    CutLines(*bytes);
    const ProfileText text(std::move(*bytes));
    Result.SectionNameBytes = 1;
    for (const std::string_view name : text.SectionNames()) {
      Result.SectionNameBytes += name.size() + 1;
    }
    const std::string count(text.Find("History", "Count").value_or(""));
    Result.Starts = static_cast<size_t>(std::max(0LL, std::strtoll(count.c_str(), nullptr, 10)));
    ReadSections(text);
  }

  void CutLines(std::string& text) {
    size_t end = 0;
    for (size_t lines = 0; lines < kMostLinesOfHistoryFile && end < text.size(); ++lines) {
      end = std::min(text.find('\n', end), text.size() - 1) + 1;
    }
    if (end < text.size()) {
      text.resize(end);
      ReportLimit("History.ini has more than 500,000 lines; the others are left out");
    }
  }

  void ReadSections(const ProfileText& text) {
    std::unordered_set<std::string> names;
    for (size_t i = 0; i < text.SectionCount(); ++i) {
      EventSection section;
      const bool hasKey = ReadSection(text, i, section);
      const bool isEvent = hasKey || !EqualsIgnoringCase(section.Name, "History");
      if (section.Name.empty() || !isEvent || !names.insert(LoweredAscii(section.Name)).second) {
        continue;
      }
      if (names.size() > kMostEvents) {
        ReportLimit(tooManyEvents, Decoder.ToUtf8(section.Name));
        return;
      }
      AddSection(section);
    }
  }

  void AddSection(const EventSection& section) {
    Event event = EventOfSection(section, Decoder);
    const auto report = FindReport(event, Decoder.ToUtf8(section.EventLogFile));
    if (report) {
      Claimed.insert(*report);
      event.Report = Files.PathOf(*report);
    }
    FindFilesOf(event);
    if (Identity && event.Identity != *Identity) {
      return;
    }
    if (!report) {
      AddRun({}, std::move(event));
      return;
    }
    ReportFacts facts;
    facts.Identity = section.Name;
    facts.StartTime = IfNotEmpty(section.StartTime);
    facts.EndTime = IfNotEmpty(section.EndTime);
    facts.IsPlaced = *event.Report != event.Identity + '/' + reportName;
    facts.MayHaveEnded = HasEnded(section);
    ReadReport(*report, facts, std::move(event));
  }

  // Where the history file has it; else where the event's copy has it, as a run may break off
  // between the move and the change of the key.
  std::optional<size_t> FindReport(const Event& event, const std::string& eventLogFile) const {
    if (const auto file = Files.FindNamed(eventLogFile)) {
      return file;
    }
    const std::string ownPath = event.Identity + '/' + reportName;
    const auto file = event.Copy.empty() ? std::nullopt : Files.Find(event.Copy + '/' + ownPath);
    return file || !eventLogFile.empty() ? file : Files.Find(ownPath);
  }

  void FindFilesOf(Event& event) const {
    const std::string folder =
        event.Report ? event.Report->substr(0, event.Report->rfind('/') + 1)
                     : (event.Copy.empty() ? "" : event.Copy + '/') + event.Identity + '/';
    for (EventFile& file : event.Files) {
      const auto found = Files.Find(folder + file.Name);
      file.IsPresent = found.has_value();
      file.Size = found ? From.Files[*found].Size : 0;
    }
  }

  void ReadOrphans() {
    for (size_t i = 0; i < From.Files.size(); ++i) {
      const std::string& path = Files.PathOf(i);
      if (path.ends_with('/' + reportName) && !Claimed.contains(i)) {
        ReadOrphan(i, path);
      }
    }
  }

  void ReadOrphan(size_t file, const std::string& path) {
    const std::string folder = path.substr(0, path.rfind('/'));
    const size_t copyEnd = folder.rfind('/');
    Event event;
    event.Identity = folder.substr(copyEnd + 1);
    event.Origin = EventOrigin::kOrphan;
    event.Copy = copyEnd == folder.npos ? "" : folder.substr(0, copyEnd);
    event.Report = path;
    if (!Identity || event.Identity == *Identity) {
      ReadReport(file, {}, std::move(event));
    }
  }

  // Completes the event and adds it, and the earlier runs that its report has.
  void ReadReport(size_t file, const ReportFacts& facts, Event event) {
    if (Result.Events.size() >= kMostEvents) {
      ReportLimit(tooManyEvents, event.Identity);
      return;
    }
    std::optional<std::string> text = From.Read(file);
    if (!text) {
      event.IsReportWhole = false;
      AddRun({}, std::move(event));
      return;
    }
    UnifyLineEnds(*text);
    const std::vector<ReportRun> runs = ParseReport(*text, facts);
    Event earlier;
    earlier.Identity = event.Identity;
    earlier.Origin = EventOrigin::kEarlierRun;
    earlier.Report = event.Report;
    AddRun(runs.back(), std::move(event));
    for (size_t i = 0; i + 1 < runs.size(); ++i) {
      AddRun(runs[i], earlier);
    }
  }

  void AddRun(const ReportRun& run, Event event) {
    event.IsReportWhole = event.IsReportWhole && run.IsWhole;
    AddFactsOfRun(run, Decoder, event);
    const size_t bytes = BytesOfFacts(event);
    if (Result.Events.size() >= kMostEvents) {
      ReportLimit(tooManyEvents, event.Identity);
      return;
    }
    if (bytes > kMostBytesOfFacts - FactBytes) {
      ReportLimit("left out, like others: the facts of all events take more than 16 MiB",
                  event.Identity);
      return;
    }
    FactBytes += bytes;
    AddDetails(run, event);
    Result.Events.push_back(std::move(event));
  }

  void AddDetails(const ReportRun& run, Event& event) {
    event.HasBefore = run.Before.has_value();
    event.HasAfter = run.After.has_value();
    const bool keeps = Depth == Detail::kAll && DetailBytes < kMostBytesOfDetails;
    if (run.Before && run.After) {
      event.Differences = CompareSnapshots(*run.Before, *run.After, Decoder,
                                           keeps ? ChangeDetail::kList : ChangeDetail::kCounts);
    }
    if (Depth == Detail::kCounts) {
      return;
    }
    if (!keeps) {
      ReportLimit(
          "changes and messages from here on are left out: they take more than 32 MiB; read fewer "
          "events at once",
          event.Identity);
      return;
    }
    const ChangeCounts& counts = event.Differences.Counts;
    const bool hasAllMessages = AddMessages(run, event);
    if (!hasAllMessages ||
        event.Differences.List.size() < counts.Added + counts.Removed + counts.Changed) {
      From.Findings.Add({FindingLevel::kError, "damaged", event.Identity,
                         "its changes and messages take more than 4 MiB; the others are left out"});
    }
    DetailBytes += event.Differences.Bytes + event.Messages.size();
  }

  // False if some are beyond the limit.
  bool AddMessages(const ReportRun& run, Event& event) const {
    for (const std::string_view piece : run.Messages) {
      const size_t used = event.Differences.Bytes + event.Messages.size();
      const std::string_view kept =
          FirstBytes(piece, kMostBytesOfEvent - std::min(kMostBytesOfEvent, used));
      event.Messages += Decoder.ToUtf8(kept);
      if (!kept.empty() && !kept.ends_with('\n')) {
        event.Messages += '\n';
      }
      if (kept.size() < piece.size()) {
        return false;
      }
    }
    return true;
  }

  Source& From;
  const TextDecoder& Decoder;
  Detail Depth;
  const std::optional<std::string>& Identity;
  HistoryFiles Files;
  std::unordered_set<size_t> Claimed;  // the reports that a section names
  std::unordered_set<std::string_view> ReportedLimits;
  size_t FactBytes = 0;
  size_t DetailBytes = 0;
  History Result;
};

}  // namespace

void ForEachMessage(const Event& event, const std::function<void(std::string_view)>& use) {
  for (std::string_view rest = event.Messages; !rest.empty();) {
    const size_t end = rest.find('\n');
    use(rest.substr(0, end));
    rest.remove_prefix(end + 1);
  }
}

History ReadHistory(Source& source, const TextDecoder& decoder, Detail detail,
                    const std::optional<std::string>& identity) {
  return HistoryReader(source, decoder, detail, identity).Read();
}
