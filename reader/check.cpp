#include "reader/check.h"

#include <algorithm>
#include <string>
#include <string_view>
#include <unordered_set>
#include <utility>

namespace {

// What the recorder's report reads of the list of section names.
constexpr size_t mostNameBytes = 10240;

class Checker {
 public:
  explicit Checker(const History& history) : Checked(history) {}

  FindingList Check() {
    CheckHistoryFile();
    for (const Event& event : Checked.Events) {
      if (event.Origin == EventOrigin::kSection) {
        Sections.insert(event.Identity);
      }
    }
    for (const Event& event : Checked.Events) {
      CheckEvent(event);
    }
    CheckStarts();
    return std::move(Findings);
  }

 private:
  void Add(FindingLevel level, const char* code, const std::string& event, std::string text) {
    Findings.Add({level, code, event, std::move(text)});
  }

  void CheckHistoryFile() {
    if (!Checked.HasHistoryFile) {
      Add(FindingLevel::kError, "damaged", "", "History.ini is missing or cannot be read");
    }
    const size_t bytes = Checked.SectionNameBytes;
    const std::string size = "the list of section names has " + std::to_string(bytes) + " of " +
                             std::to_string(mostNameBytes) + " bytes";
    if (bytes > mostNameBytes) {
      Add(FindingLevel::kError, "names-limit", "",
          size + ": the newest events are missing from the recorder's summary");
    } else if (bytes * 10 > mostNameBytes * 8) {
      Add(FindingLevel::kWarning, "names-limit", "",
          size + ": beyond them the newest events are missing from the recorder's summary");
    }
  }

  void CheckEvent(const Event& event) {
    const std::string& identity = event.Identity;
    if (event.Origin != EventOrigin::kSection) {
      CheckRunWithoutSection(event);
      CheckReport(event);
      return;
    }
    if (event.State == EventState::kNoStart) {
      Add(FindingLevel::kWarning, "no-start", identity, "ended, but was not started");
    } else if (event.State == EventState::kOpen) {
      Add(FindingLevel::kWarning, "never-ended", identity, "started, but has not ended");
    }
    if (event.State != EventState::kOpen && event.Copy.empty()) {
      Add(FindingLevel::kWarning, "no-copy", identity, "ended without the name of a copy");
    }
    CheckReport(event);
    CheckFiles(event);
  }

  void CheckRunWithoutSection(const Event& event) {
    const std::string report = event.Report.value_or("");
    if (event.Origin == EventOrigin::kEarlierRun) {
      Add(FindingLevel::kWarning, "started-again", event.Identity,
          "an earlier run is in the report " + report);
    } else if (Sections.contains(event.Identity)) {
      Add(FindingLevel::kWarning, "started-again", event.Identity,
          "an earlier run has the report " + report);
    } else {
      Add(FindingLevel::kWarning, "damaged", event.Identity,
          "no section of History.ini names the report " + report);
    }
  }

  // An event without a start has no report.
  void CheckReport(const Event& event) {
    if (!event.Report && event.State != EventState::kNoStart) {
      Add(FindingLevel::kError, "report-missing", event.Identity,
          "its report, ORXInstallEvent.Log, is not there");
    } else if (event.Report && !event.IsReportWhole) {
      Add(FindingLevel::kWarning, "damaged", event.Identity,
          "the report " + *event.Report + " breaks off or cannot be read");
    } else if (event.HasBefore && event.HasAfter && !IsCompared(event)) {
      Add(FindingLevel::kWarning, "damaged", event.Identity,
          "the report " + *event.Report + " has a list that cannot be compared");
    }
  }

  static bool IsCompared(const Event& event) {
    const auto& compared = event.Differences.Compared;
    return std::find(compared.begin(), compared.end(), false) == compared.end();
  }

  // Before the first report of a history no file has been collected.
  void CheckFiles(const Event& event) {
    const FindingLevel level = Checked.WasReported ? FindingLevel::kWarning : FindingLevel::kNote;
    for (const EventFile& file : event.Files) {
      if (!file.IsPresent) {
        Add(level, "file-missing", event.Identity,
            std::string(file.Key) + " names " + file.Path +
                (Checked.WasReported ? ", which is not there" : ", which is not collected yet"));
      }
    }
  }

  // A start under an identity of an earlier event that has left nothing but the count.
  void CheckStarts() {
    size_t known = 0;
    for (const Event& event : Checked.Events) {
      known += event.State == EventState::kNoStart ? 0 : 1;
    }
    if (Checked.Starts > known) {
      Add(FindingLevel::kWarning, "started-again", "",
          "the history counts " + std::to_string(Checked.Starts) + " starts and has " +
              std::to_string(known) + ": an identity was started again, or a section is lost");
    }
  }

  const History& Checked;
  std::unordered_set<std::string_view> Sections;  // identities
  FindingList Findings;
};

}  // namespace

FindingList CheckHistory(const History& history) { return Checker(history).Check(); }
