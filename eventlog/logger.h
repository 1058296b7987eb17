#pragma once

#include <fstream>
#include <string>

// The one text stream of a run, on the event's ORXInstallEvent.Log. Writers use the ordinary
// insertion operators and end each line with std::endl, which flushes it, so that after a crash all
// complete lines are in the file. (Flushed means handed to the system, not forced to disk.)
// Formatting flags that one writer sets stay set for the next.
//
// Without an open file, after a failed Open and after a failed write, insertions do nothing; they
// throw nothing, and no caller tests the stream.
class CLogger : public std::ofstream {
 public:
  static CLogger& GetInstance();

  // Closes the file that is open and opens the named one for output, as text and shared with other
  // programs: std::ios::out empties an existing file, std::ios::app writes at its end. A missing
  // file is created, a missing folder is not. Waits for another program that keeps the file open
  // (WaitWhileHeld). If the file cannot be opened, the stream is in its failure state.
  void Open(const std::string& fileName, std::ios_base::openmode mode);

  // Does nothing if no file is open.
  void Close();

 private:
  CLogger() = default;
};
