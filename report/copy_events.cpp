#include "report/copy_events.h"

#include <algorithm>

#include "app/install_history.h"
#include "history/ini_file.h"
#include "history/locations.h"

bool CInstallHistory::HistoryFileExists() const {
  return HistoryDirExists() && FileExists(GetHistoryFilePath());
}

std::vector<std::string> CInstallHistory::GetEventSections() const {
  std::vector<std::string> sections = CIniFile(GetHistoryFilePath()).GetSectionNames();
  std::erase(sections, "History");
  return sections;
}

void CInstallHistory::GroupEvents(const std::vector<std::string>& sections,
                                  std::vector<std::unique_ptr<CCopyEvents>>& groups) const {
  for (const std::string& section : sections) {
    const CInstallEvent event(section);
    const std::string copyName = event.GetCopyName();
    const std::string& name = copyName.empty() ? section : copyName;
    const auto hasName = [&name](const auto& group) { return group->Name == name; };
    auto group = std::find_if(groups.begin(), groups.end(), hasName);
    if (group == groups.end()) {
      group = groups.insert(groups.end(), std::make_unique<CCopyEvents>());
      (*group)->Name = name;
    }
    (*group)->Events.push_back(event);
  }
}
