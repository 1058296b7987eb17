#include "eventlog/logger.h"

#include "platform/output_stream.h"

CLogger& CLogger::GetInstance() {
  static CLogger instance;
  return instance;
}

void CLogger::Open(const std::string& fileName, std::ios_base::openmode mode) {
  Close();
  OpenStream(*this, fileName, mode);
}

void CLogger::Close() {
  if (is_open()) {
    close();
  }
}
