#include "platform/registry.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <memory>

#include "platform/known_folders.h"
#include "platform/posix/registry_export.h"

namespace {

// The export as a file that stays open while the run asks. What is no regular file, or cannot be
// opened, is empty; so is what lies behind the first GiB.
class ExportFile {
 public:
  explicit ExportFile(const std::string& path)
      : Descriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY)) {
    struct stat status = {};
    IsReadable = Descriptor >= 0 && ::fstat(Descriptor, &status) == 0 && S_ISREG(status.st_mode);
  }
  ~ExportFile() {
    if (Descriptor >= 0) {
      ::close(Descriptor);
    }
  }
  ExportFile(const ExportFile&) = delete;
  ExportFile& operator=(const ExportFile&) = delete;

  size_t Read(uint64_t offset, char* buffer, size_t size) const {
    constexpr uint64_t longest = uint64_t{1} << 30;
    size = static_cast<size_t>(std::min<uint64_t>(size, longest - std::min(offset, longest)));
    size_t got = 0;
    while (IsReadable && got < size) {
      const ssize_t count =
          ::pread(Descriptor, buffer + got, size - got, static_cast<off_t>(offset + got));
      if (count > 0) {
        got += static_cast<size_t>(count);
      } else if (count == 0 || errno != EINTR) {
        break;
      }
    }
    return got;
  }

 private:
  int Descriptor;
  bool IsReadable = false;
};

struct OpenExport {
  explicit OpenExport(const std::string& path) : Path(path), File(path) {}

  std::string Path;
  ExportFile File;
  RegistryExport Export{[this](uint64_t offset, char* buffer, size_t size) {
    return File.Read(offset, buffer, size);
  }};
};

// The one export of a run, opened by the first question.
RegistryExport& MachineRegistry() {
  static std::unique_ptr<OpenExport> current;
  constexpr int32_t commonAppData = 35;
  const std::string path = GetFolderPath(commonAppData) + "/ZEK/Registry.reg";
  if (!current || current->Path != path) {
    current = std::make_unique<OpenExport>(path);
  }
  return current->Export;
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
