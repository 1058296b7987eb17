#include <iostream>

#include "app/install_history.h"
#include "history/locations.h"
#include "platform/files.h"
#include "platform/memory.h"
#include "platform/path.h"
#include "report/zipper.h"

int CInstallHistory::Report(const std::string& archiveName) {
  KeepFreedMemory();  // minizip allocates a quarter of a megabyte for each file
  WriteSummary();
  return CreateArchive(archiveName);
}

// True for a file that the history itself uses. Compared as files, so that another spelling of the
// name is recognised.
static bool IsHistoryFile(const std::string& path) {
  const std::string folder = FolderPart(path);
  for (const char* name : {"History.ini", "ORXInstallEvent.Log", "Summary.txt"}) {
    if (IsSameFile(path, JoinPath(folder, name))) {
      return true;
    }
  }
  return IsSameFile(path, GetHistoryFilePath());
}

int CInstallHistory::CreateArchive(const std::string& archiveName) {
  CZipper zipper;
  const std::string folder = GetHistoryDir();
  if (!HistoryDirExists()) {
    std::cout << "There is no ORX Installation History Log ( no ORX V9 or Later is installed )"
              << std::endl;
    return 0;
  }
  zipper.GuardedFile = GetHistoryFilePath();
  const bool created = !IsHistoryFile(archiveName) &&
                       zipper.Open(archiveName.c_str(), folder.c_str()) && zipper.AddFolder(folder);
  const bool closed = zipper.Close();
  if (!created) {
    std::cout << " Failed to create file '" << archiveName << "'" << std::endl;
    return 0;
  }
  IsArchiveComplete = closed && zipper.IsWithinLimits();
  std::cout << "The file '" << archiveName << "' is created successfully" << std::endl;
  return 1;
}
