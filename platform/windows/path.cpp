#include "platform/path.h"

#include "platform/windows/system.h"

const char kPathSeparator = '\\';
const std::string_view kPathSeparators = "\\/";

bool IsRootedPath(const std::string& path) { return path.find(':') != std::string::npos; }

std::optional<std::string> AbsolutePath(const std::string& path) {
  char buffer[MAX_PATH] = {};
  const DWORD length =
      ::GetFullPathNameA(path.c_str(), sizeof buffer, buffer, /*lpFilePart=*/nullptr);
  if (length == 0 || length >= sizeof buffer) {
    return std::nullopt;
  }
  return buffer;
}
