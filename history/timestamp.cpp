#include "history/timestamp.h"

#include <ctime>

std::string GetTimestamp() {
  const std::time_t now = std::time(nullptr);
  char text[128] = {};
  std::strftime(text, sizeof text, "%Y%m%d %H:%M:%S", std::localtime(&now));
  return text;
}
