#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <ctime>
#include <string>
#include <string_view>

#include "fuzz/support.h"
#include "history/ini_file.h"
#include "history/locations.h"
#include "platform/posix/registry/registry_export.h"
#include "platform/profile_text.h"
#include "report/zip_names.h"

// A head and a unit, with a NUL between them: the head is followed by as many units as make a large
// text, which every parser reads. Work that grows with the square of the length, which would hold
// up a run that meets such a file or argument, is far above the limit; work that grows with the
// length is far below it, also with sanitizers. CPU time is measured, so that a busy machine does
// not matter.

namespace {

double ProcessorSeconds() {
  timespec time = {};
  ::clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

template <typename Work>
void RequireQuick(Work work, int line = __builtin_LINE()) {
  constexpr double limit = 0.5;
  const double begin = ProcessorSeconds();
  work();
  Require(ProcessorSeconds() - begin < limit, line);
}

void ReadProfile(const std::string& text) {
  ProfileText profile(text);
  profile.SectionNames();
  profile.Find("x", "Count");
  profile.Set("History", "Count", "1");
}

void ReadRegistry(const std::string& text) {
  RegistryExport registry([&text](uint64_t offset, char* buffer, size_t size) {
    return offset < text.size() ? text.copy(buffer, size, offset) : 0;
  });
  registry.SubKeyNames("");
  registry.ValueNames("a");
  registry.Read("a\\b", "a", 100);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  // No such folder: what is parsed of an argument is of interest here, not the files.
  ::setenv("ORX_COMMON_APPDATA", "/no/folder", /*overwrite=*/1);
  constexpr size_t fileSize = 256 * 1024;
  constexpr size_t argumentSize = 128 * 1024;  // more than a system takes
  const std::vector<std::string> parts = Split(std::string(data, data + size), '\0');
  const std::string& unit = parts.back();
  if (unit.empty()) {
    return 0;
  }
  std::string text = parts.size() > 1 ? parts.front() : "";
  while (text.size() < fileSize) {
    text += unit;
  }
  RequireQuick([&] { ReadProfile(text); });
  RequireQuick([&] { ReadRegistry(text); });
  const std::string argument = text.substr(0, argumentSize);
  RequireQuick([&] { LeadsElsewhere(argument); });
  RequireQuick([&] { ReplaceExtension(TrimHead(TrimTail(argument)), ".zip"); });
  RequireQuick([&] { CIniFile(GetHistoryFilePath()).WriteString(argument, "Key", argument); });
  return 0;
}
