#include "report/collected_files.h"

#include <vector>

#include "app/install_event.h"
#include "history/locations.h"
#include "platform/files.h"
#include "platform/path.h"
#include "platform/profile_file.h"

namespace {

struct FileKey {
  std::string (CInstallEvent::*Get)() const;
  void (CInstallEvent::*Set)(const std::string&);
};

// In the order of handling: of two files with the same name the first is copied.
constexpr FileKey fileKeys[] = {
    {&CInstallEvent::GetLogFileName, &CInstallEvent::SetLogFileName},
    {&CInstallEvent::GetTraceFile, &CInstallEvent::SetTraceFile},
    {&CInstallEvent::GetResponseFile, &CInstallEvent::SetResponseFile},
};

struct CollectedFile {
  CInstallEvent& Event;
  FileKey Key;
  std::string Source;
  std::string Target;
};

// The target's name is below the history folder.
bool CopyIntoHistory(const std::string& source, const std::string& targetName) {
  const std::string target = JoinPath(GetHistoryDir(), targetName);
  return FileExists(source) && !FileExists(target) && !LeadsElsewhere(targetName) &&
         CopyToNewFile(source, target, /*trusted=*/GetHistoryFilePath());
}

void CopyFilesOf(CInstallEvent& event, std::vector<CollectedFile>& collected) {
  const std::string copyName = event.GetCopyName();
  const std::string folder = copyName.empty() ? event.EventID : JoinPath(copyName, event.EventID);
  for (const FileKey& key : fileKeys) {
    const std::string source = (event.*key.Get)();
    const std::string name = JoinPath(folder, BaseName(source));
    if (CopyIntoHistory(source, name)) {
      collected.push_back({event, key, source, JoinPath(GetHistoryDir(), name)});
    }
  }
}

}  // namespace

void CInstallEvent::CollectFiles() { ::CollectFiles({this, 1}); }

void CollectFiles(std::span<CInstallEvent> events) {
  std::vector<CollectedFile> collected;
  for (CInstallEvent& event : events) {
    CopyFilesOf(event, collected);
  }
  if (collected.empty()) {
    return;
  }
  // The copies were made without the guard, so another run may have named another file since.
  const ProfileGuard guard(GetHistoryFilePath());
  for (const CollectedFile& file : collected) {
    if ((file.Event.*file.Key.Get)() == file.Source) {
      (file.Event.*file.Key.Set)(file.Target);
    }
  }
}
