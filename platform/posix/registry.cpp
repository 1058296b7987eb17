#include "platform/registry.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <memory>
#include <optional>

#include "platform/known_folders.h"
#include "platform/posix/descriptor.h"
#include "platform/posix/file_calls.h"
#include "platform/posix/registry_export.h"

namespace {

size_t ReadAt(const Descriptor& file, uint64_t offset, char* buffer, size_t size) {
  size_t got = 0;
  while (got < size) {
    const ssize_t count = RetryOnInterrupt([&] {
      return ::pread(file.Get(), buffer + got, size - got, static_cast<off_t>(offset + got));
    });
    if (count <= 0) {
      break;
    }
    got += static_cast<size_t>(count);
  }
  return got;
}

// Bytes of a regular file; none of anything else, or of a file that cannot be opened. What lies
// behind the first GiB is not seen.
ByteReader ReaderOf(const std::string& path) {
  // Without O_NONBLOCK a pipe in the file's place would hold up the run.
  const auto file = std::make_shared<Descriptor>(RetryOnInterrupt(
      [&] { return ::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY); }));
  struct stat status = {};
  if (!file->IsOpen() || !StatusOf(*file, status) || !S_ISREG(status.st_mode)) {
    return [](uint64_t, char*, size_t) { return size_t{0}; };
  }
  return [file](uint64_t offset, char* buffer, size_t size) {
    constexpr uint64_t longest = uint64_t{1} << 30;
    const uint64_t left = longest - std::min(offset, longest);
    return ReadAt(*file, offset, buffer, static_cast<size_t>(std::min<uint64_t>(size, left)));
  };
}

// The one export of a run; another only if the folder becomes another.
RegistryExport& MachineRegistry() {
  static std::string currentPath;
  static std::optional<RegistryExport> current;
  constexpr int32_t commonAppData = 35;
  const std::string path = GetFolderPath(commonAppData) + "/ZEK/Registry.reg";
  if (path != currentPath) {
    current.emplace(ReaderOf(path));
    currentPath = path;
  }
  return *current;
}

}  // namespace

// The access is not looked at: who may read the export may ask anything of it.
RegistryData ReadRegistryData(const std::string& keyPath, const std::string& valueName,
                              size_t limit, RegistryAccess /*access*/) {
  return MachineRegistry().Read(keyPath, valueName, limit);
}

std::vector<std::string> EnumRegistryValueNames(const std::string& keyPath) {
  return MachineRegistry().ValueNames(keyPath);
}

std::vector<std::string> EnumRegistrySubKeys(const std::string& keyPath) {
  return MachineRegistry().SubKeyNames(keyPath);
}
