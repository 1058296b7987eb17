#include "reader/history.h"

#include <algorithm>
#include <iterator>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include "platform/ascii_case.h"
#include "platform/profile_text.h"
#include "reader/event_section.h"
#include "reader/history_files.h"
#include "reader/report.h"

namespace {

const std::string reportName = "ORXInstallEvent.Log";

// Of the changes and messages that are kept, over all events.
constexpr size_t mostBytesKept = 96 << 20;

std::optional<std::string> IfNotEmpty(std::string_view text) {
  return text.empty() ? std::nullopt : std::optional(std::string(text));
}

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

  void ReadHistoryFile() {
    const std::optional<size_t> file = Files.FindIgnoringCase("History.ini");
    std::optional<std::string> bytes = file ? From.Read(*file) : std::nullopt;
    if (!bytes) {
      return;
    }
    Result.HasHistoryFile = true;
    const ProfileText text(std::move(*bytes));
    Result.SectionNameBytes = 1;
    for (const std::string_view name : text.SectionNames()) {
      Result.SectionNameBytes += name.size() + 1;
    }
    const std::string count(text.Find("History", "Count").value_or(""));
    Result.Starts = static_cast<size_t>(std::max(0LL, std::strtoll(count.c_str(), nullptr, 10)));
    std::unordered_set<std::string> names;
    for (size_t i = 0; i < text.SectionCount(); ++i) {
      EventSection section;
      const bool hasKey = ReadSection(text, i, section);
      const bool isEvent = hasKey || !EqualsIgnoringCase(section.Name, "History");
      if (!section.Name.empty() && isEvent && names.insert(LoweredAscii(section.Name)).second) {
        AddSection(section);
      }
    }
  }

  void AddSection(const EventSection& section) {
    Event event;
    event.Identity = Decoder.ToUtf8(section.Name);
    event.State = StateOf(section);
    event.Started = ParseLocalTime(section.StartTime);
    event.Ended = ParseLocalTime(section.EndTime);
    event.Action = Decoder.ToUtf8(section.Action);
    event.Type = Decoder.ToUtf8(section.Type);
    event.Product = Decoder.ToUtf8(section.Product);
    event.Version = Decoder.ToUtf8(section.Version);
    event.ServiceLevel = Decoder.ToUtf8(section.ServiceLevel);
    event.Path = Decoder.ToUtf8(section.Path);
    event.Copy = Decoder.ToUtf8(section.CopyName);
    event.Result = Decoder.ToUtf8(section.Result);
    event.CommandLine = Decoder.ToUtf8(section.CommandLine);
    const auto report = FindReport(event, Decoder.ToUtf8(section.EventLogFile));
    if (report) {
      Claimed.insert(*report);
      event.Report = Files.PathOf(*report);
    }
    AddFiles(section, event);
    if (Identity && event.Identity != *Identity) {
      return;
    }
    Result.Events.push_back(std::move(event));
    if (report && Depth != Detail::kFacts) {
      ReportFacts facts;
      facts.Identity = section.Name;
      facts.StartTime = IfNotEmpty(section.StartTime);
      facts.EndTime = IfNotEmpty(section.EndTime);
      facts.IsPlaced = Files.PathOf(*report) != Decoder.ToUtf8(section.Name) + '/' + reportName;
      facts.MayHaveEnded = HasEnded(section);
      ReadReport(*report, facts);
    }
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

  void AddFiles(const EventSection& section, Event& event) const {
    const std::string folder =
        event.Report ? event.Report->substr(0, event.Report->rfind('/') + 1)
                     : (event.Copy.empty() ? "" : event.Copy + '/') + event.Identity + '/';
    for (const auto& [key, value] : {std::pair("Log_File_Name", section.LogFileName),
                                     std::pair("Trace_File", section.TraceFile),
                                     std::pair("Response_File", section.ResponseFile)}) {
      if (value.empty() || value == "(none)") {
        continue;
      }
      EventFile& file = event.Files.emplace_back();
      file.Key = key;
      file.Path = Decoder.ToUtf8(value);
      file.Name = LastPart(file.Path);
      const auto found = Files.Find(folder + file.Name);
      file.IsPresent = found.has_value();
      file.Size = found ? From.Files[*found].Size : 0;
    }
  }

  void ReadOrphans() {
    if (Depth == Detail::kFacts) {
      return;
    }
    for (size_t i = 0; i < From.Files.size(); ++i) {
      const std::string& raw = From.Files[i].Path;
      if (!raw.ends_with(reportName) || Claimed.contains(i)) {
        continue;
      }
      const std::string path = Files.PathOf(i);
      const size_t folderEnd = path.rfind('/');
      if (LastPart(path) != reportName || folderEnd == path.npos) {
        continue;
      }
      const std::string folder = path.substr(0, folderEnd);
      const size_t copyEnd = folder.rfind('/');
      const std::string name = folder.substr(copyEnd + 1);
      if (Identity && name != *Identity) {
        continue;
      }
      Event& event = Result.Events.emplace_back();
      event.Identity = name;
      event.Origin = EventOrigin::kOrphan;
      event.Copy = copyEnd == folder.npos ? "" : folder.substr(0, copyEnd);
      event.Report = path;
      ReadReport(i, {});
    }
  }

  // Completes the event that was added last, and adds the earlier runs that its report has.
  void ReadReport(size_t file, const ReportFacts& facts) {
    std::optional<std::string> text = From.Read(file);
    if (!text) {
      Result.Events.back().IsReportWhole = false;
      return;
    }
    UnifyLineEnds(*text);
    const std::vector<ReportRun> runs = ParseReport(*text, facts);
    Event& event = Result.Events.back();
    TakeRun(runs.back(), event);
    std::vector<Event> earlier(runs.size() - 1);
    for (size_t i = 0; i < earlier.size(); ++i) {
      earlier[i].Identity = event.Identity;
      earlier[i].Origin = EventOrigin::kEarlierRun;
      earlier[i].Report = event.Report;
      TakeRun(runs[i], earlier[i]);
    }
    std::move(earlier.begin(), earlier.end(), std::back_inserter(Result.Events));
  }

  void TakeRun(const ReportRun& run, Event& event) {
    event.IsReportWhole = run.IsWhole;
    if (run.Computer) {
      event.Computer = Decoder.ToUtf8(*run.Computer);
    }
    if (event.Origin != EventOrigin::kSection) {
      TakeFacts(run, event);
    }
    event.HasBefore = run.Before.has_value();
    event.HasAfter = run.After.has_value();
    const bool keeps = Depth == Detail::kAll && BytesKept < mostBytesKept;
    if (run.Before && run.After) {
      event.Differences = CompareSnapshots(*run.Before, *run.After, Decoder,
                                           keeps ? ChangeDetail::kList : ChangeDetail::kCounts);
    }
    if (keeps) {
      TakeMessages(run, event);
    } else if (Depth == Detail::kAll && !IsFull) {
      IsFull = true;
      From.Findings.push_back({FindingLevel::kError, "damaged", event.Identity,
                               "changes and messages from here on are left out: they take more "
                               "than 96 MiB; read fewer events at once"});
    }
  }

  void TakeMessages(const ReportRun& run, Event& event) {
    for (const std::string_view piece : run.Messages) {
      event.Messages += Decoder.ToUtf8(piece);
      if (!piece.ends_with('\n')) {
        event.Messages += '\n';
      }
    }
    BytesKept += event.Messages.size();
    for (const Change& change : event.Differences.List) {
      BytesKept += sizeof change + change.Name.size();
      for (const FieldChange& field : change.Fields) {
        BytesKept +=
            sizeof field + field.Before.value_or("").size() + field.After.value_or("").size();
      }
    }
  }

  // What no section says of a run.
  void TakeFacts(const ReportRun& run, Event& event) const {
    event.State = run.Start ? EventState::kOpen : EventState::kNoStart;
    event.Action = Decoder.ToUtf8(run.StartAction);
    if (run.Start) {
      event.Identity = Decoder.ToUtf8(run.Start->Identity);
      event.Started = ParseLocalTime(run.Start->Time);
      event.Product = Decoder.ToUtf8(run.Start->Product);
      event.ServiceLevel = Decoder.ToUtf8(run.Start->ServiceLevel);
      event.CommandLine = Decoder.ToUtf8(run.Start->CommandLine);
    }
    if (!run.Result) {
      return;
    }
    const ResultBlock& result = *run.Result;
    if (const auto started = ParseLocalTime(result.StartTime)) {
      event.Started = started;
    }
    event.Ended = ParseLocalTime(result.EndTime);
    event.Action = Decoder.ToUtf8(result.Action);
    event.Product = Decoder.ToUtf8(result.Product);
    event.ServiceLevel = Decoder.ToUtf8(result.ServiceLevel);
    event.Type = Decoder.ToUtf8(result.Type);
    event.Result = Decoder.ToUtf8(result.Result);
    if (run.Start) {
      event.State = StateOfResult(event.Result);
    }
  }

  Source& From;
  const TextDecoder& Decoder;
  Detail Depth;
  const std::optional<std::string>& Identity;
  HistoryFiles Files;
  std::unordered_set<size_t> Claimed;  // the reports that a section names
  size_t BytesKept = 0;
  bool IsFull = false;
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
