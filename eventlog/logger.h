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

  // Closes the file that is open and opens the named one through OpenStream
  // (platform/output_stream.h): std::ios::out empties it, std::ios::app writes at its end.
  void Open(const std::string& fileName, std::ios_base::openmode mode);

  // Does nothing if no file is open.
  void Close();

 private:
  CLogger() = default;
};
