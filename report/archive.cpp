#include <iostream>

#include "app/install_history.h"
#include "history/locations.h"
#include "platform/files.h"
#include "platform/memory.h"
#include "report/zipper.h"

int CInstallHistory::Report(const std::string& archiveName) {
  KeepFreedMemory();  // each file is packed with a quarter of a megabyte of its own
  WriteSummary();
  return CreateArchive(archiveName);
}

int CInstallHistory::CreateArchive(const std::string& archiveName) const {
  CZipper zipper;
  const std::string folder = GetHistoryDir();
  if (!DirExists(folder)) {
    std::cout << "There is no ORX Installation History Log ( no ORX V9 or Later is installed )"
              << std::endl;
    return 0;
  }
  // An older file of the archive's name is replaced, but never the history that is to be packed.
  const bool created = !IsSameFile(archiveName, GetHistoryFilePath()) &&
                       zipper.Open(archiveName.c_str(), folder.c_str()) && zipper.AddFolder(folder);
  zipper.Close();
  if (!created) {
    std::cout << " Failed to create file '" << archiveName << "'" << std::endl;
    return 0;
  }
  std::cout << "The file '" << archiveName << "' is created successfully" << std::endl;
  return 1;
}
