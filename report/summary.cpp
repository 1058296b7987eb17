#include <algorithm>
#include <fstream>
#include <span>
#include <vector>

#include "app/install_history.h"
#include "history/locations.h"
#include "platform/files.h"
#include "platform/output_stream.h"
#include "platform/path.h"
#include "report/collected_files.h"
#include "report/copy_events.h"

namespace {

// A stream that stays closed ignores what is written to it, as one that failed to open does.
void OpenBelowHistory(std::ofstream& stream, const std::string& name) {
  const std::string path = JoinPath(GetHistoryDir(), name);
  // Opening a pipe would wait for its reader.
  if (!LeadsElsewhere(name) && KindOf(path) != FileKind::kOther) {
    OpenStream(stream, path, std::ios::out);
  }
}

void OpenCopySummary(std::ofstream& stream, const std::string& copyName) {
  const std::string name = JoinPath(copyName, "Summary.txt");
  // The folder of a copy called "." contains the overall summary, which is open already.
  const std::string overall = JoinPath(GetHistoryDir(), "Summary.txt");
  if (!IsSameFile(JoinPath(GetHistoryDir(), name), overall)) {
    OpenBelowHistory(stream, name);
  }
}

void WriteOverallHead(std::ostream& out, size_t copies) {
  const std::string rule(62, '-');
  out << rule << std::endl;
  out << "*         Overall Summary of ORX Installation History        *" << std::endl;
  out << rule << std::endl;
  out << std::endl;
  out << "Total ORX Copies:" << copies << std::endl;
  out << std::string(127, '-') << std::endl;
}

void WriteCopyHead(std::ostream& out, const CCopyEvents& copy, const char* countLabel) {
  out << "ORX Installation Copy:" << copy.Name << std::endl;
  out << countLabel << copy.Events.size() << std::endl;
  out << std::string(127, '-') << std::endl;
}

void WriteEventBlock(std::ostream& out, const CInstallEvent& event) {
  out << "Event ID        :" << event.GetEventID() << std::endl;
  out << "Start Time      :" << event.GetStartTime() << std::endl;
  out << "End Time        :" << event.GetEndTime() << std::endl;
  out << "Install Type    :" << event.GetType() << std::endl;
  out << "Product         :" << event.GetProduct() << std::endl;
  out << "Version         :" << event.GetVersion() << std::endl;
  out << "Service Level   :" << event.GetServiceLevel() << std::endl;
  out << "Install Path    :" << event.GetPath() << std::endl;
  out << "Copy Name       :" << event.GetCopyName() << std::endl;
  out << "Log File Name   :" << event.GetLogFileName() << std::endl;
  out << "Trace File Name :" << event.GetTraceFile() << std::endl;
  out << "Response File   :" << event.GetResponseFile() << std::endl;
  out << "Event Log File  :" << event.GetEventLogFile() << std::endl;
  out << "Result          :" << event.GetResult() << std::endl;
  out << std::string(127, '-') << std::endl;
}

void WriteCopy(std::ostream& overall, const CCopyEvents& copy) {
  std::ofstream own;
  OpenCopySummary(own, copy.Name);
  WriteCopyHead(overall, copy, "Count of Events      :");
  WriteCopyHead(own, copy, "Count of Events:");
  // A run that is killed between the copying of files and the writing of their keys leaves keys
  // that no later run corrects. This limits them to those of so many events.
  constexpr size_t most = 64;
  std::vector<CInstallEvent> events = copy.Events;
  for (size_t begin = 0; begin < events.size(); begin += most) {
    const auto some = std::span(events).subspan(begin, std::min(most, events.size() - begin));
    CollectFiles(some);  // first, as it sets keys that are printed below
    for (const CInstallEvent& event : some) {
      WriteEventBlock(overall, event);
      overall << std::endl;
      WriteEventBlock(own, event);
    }
  }
  own << std::endl;
  own << " -------------------- end of sumamry -------------------- ";
}

}  // namespace

int CInstallHistory::WriteSummary() {
  if (!HistoryFileExists()) {
    return 0;
  }
  std::ofstream overall;
  OpenBelowHistory(overall, "Summary.txt");
  std::vector<std::unique_ptr<CCopyEvents>> groups;
  GroupEvents(GetEventSections(), groups);
  WriteOverallHead(overall, groups.size());
  for (const std::unique_ptr<CCopyEvents>& copy : groups) {
    WriteCopy(overall, *copy);
  }
  overall
      << "----------------------  end of overall summary ----------------------------------------"
      << std::endl;
  return 1;
}
