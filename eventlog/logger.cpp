#include "eventlog/logger.h"

#include <cerrno>

CLogger& CLogger::GetInstance() {
  static CLogger instance;
  return instance;
}

void CLogger::Open(const std::string& fileName, std::ios_base::openmode mode) {
  Close();
  do {
    open(fileName, mode | std::ios::out);
  } while (!is_open() && errno == EINTR);
}

void CLogger::Close() {
  if (is_open()) {
    close();
  }
}
