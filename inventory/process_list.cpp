#include "inventory/process_list.h"

#include <iomanip>

#include "eventlog/logger.h"
#include "inventory/filter.h"
#include "inventory/shown_name.h"
#include "platform/computer.h"
#include "platform/processes.h"

bool IsWindowsNTFamily() {
  const SystemVersion version =
      QuerySystemVersion(VersionForm::kExtended).value_or(SystemVersion());
  if (version.MajorVersion != 4) {
    return true;
  }
  const bool is95 = version.MinorVersion == 0 && version.PlatformID == 1;
  return !is95 && version.MinorVersion != 10 && version.MinorVersion != 90;
}

int32_t CProcessList::Collect() {
  Processes.clear();
  return IsWindowsNTFamily() ? CollectNT() : CollectWindows95();
}

int32_t CProcessList::CollectNT() {
  const uint32_t own = OwnProcessID();
  for (const uint32_t id : ListProcessIDs().value_or(std::vector<uint32_t>())) {
    if (id == own || id == 0) {
      continue;
    }
    if (const std::optional<ProcessModule> module = FirstModuleOf(id)) {
      Processes.push_back({module->BaseName.empty() ? "UNK_NAME" : module->BaseName, id});
    }
  }
  return 0;
}

int32_t CProcessList::CollectWindows95() {
  constexpr uint32_t entrySize = 304;
  const std::optional<std::vector<ProcessEntry>> entries = SnapshotProcesses();
  if (!entries) {
    return 1;
  }
  const uint32_t own = OwnProcessID();
  for (const ProcessEntry& entry : *entries) {
    if (entry.ProcessID == own || entry.Size != entrySize) {
      continue;
    }
    // Without a backslash the whole text is the name.
    const std::string& file = entry.ExecutableFile;
    Processes.push_back({file.substr(file.rfind('\\') + 1), entry.ProcessID});
  }
  return 0;
}

bool CProcessList::Matches(const CProcessInfo& process) const {
  return MatchesFilter(g_ProcessFilter, process.Name);
}

int32_t CProcessList::Print() {
  CLogger& log = CLogger::GetInstance();
  const std::string rule = std::string(51, '-') + ' ';
  log << std::endl;
  log << "Processes:" << Processes.size() << std::endl;
  log << rule << std::endl;
  log << "Process ID         Process Name                     " << std::endl;
  log << rule << std::endl;
  for (const CProcessInfo& process : Processes) {
    if (Matches(process)) {
      log << std::setw(19) << process.ProcessID << ShownName(process.Name) << std::endl;
    }
  }
  log << "---------- Process List ( end )-------------------- " << std::endl;
  return 0;
}
