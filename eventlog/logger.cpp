#include "eventlog/logger.h"

#include <cerrno>

#include "platform/held_file.h"

CLogger& CLogger::GetInstance() {
  static CLogger instance;
  return instance;
}

void CLogger::Open(const std::string& fileName, std::ios_base::openmode mode) {
  Close();
  WaitWhileHeld(fileName);
  do {
    errno = 0;  // a failure need not set it
    open(fileName, mode | std::ios::out);
  } while (!is_open() && errno == EINTR);
}

void CLogger::Close() {
  if (is_open()) {
    close();
  }
}
