#include "eventlog/logger.h"

CLogger& CLogger::GetInstance() {
  static CLogger instance;
  return instance;
}

void CLogger::Open(const std::string& fileName, std::ios_base::openmode mode) {
  Close();
  open(fileName, mode | std::ios::out);
}

void CLogger::Close() {
  if (is_open()) {
    close();
  }
}
