#include "platform/temporary_path.h"

#include <random>

#include "platform/path.h"

std::string FixedPathBeside(const std::string& path) {
  const std::string name = BaseName(path);
  return FolderPart(path) + '.' + name.substr(0, name.rfind('.')) + ".tmp";
}

std::string RandomPathBeside(const std::string& path) {
  constexpr char digits[] = "0123456789abcdef";
  std::random_device source;
  std::string name = FolderPart(path) + '.';
  for (int i = 0; i < 16; ++i) {
    name += digits[source() % 16];
  }
  return name + ".tmp";
}
