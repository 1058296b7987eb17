#pragma once

#include <fstream>
#include <string>

// The one text stream of a run, on the event's ORXInstallEvent.Log. Writers insert into it with the
// ordinary operators and end each line with std::endl, so that all text up to the last whole line
// is on disk when a run breaks off. Formatting flags that one writer sets stay set for the next.
//
// Without an open file, after a failed Open and on a full disk, insertions do nothing and raise
// nothing; nobody tests the stream.
class CLogger : public std::ofstream {
 public:
  static CLogger& GetInstance();

  // Closes what is open and opens the named file for output: std::ios::out empties an existing
  // file, std::ios::app writes behind what it holds. Makes a missing file, but no folder.
  void Open(const std::string& fileName, std::ios_base::openmode mode);

  void Close();

 private:
  CLogger() = default;
};
