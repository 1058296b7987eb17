#include <ctime>

#include "fuzz/support.h"
#include "history/ini_file.h"
#include "history/locations.h"
#include "platform/posix/registry/registry_export.h"
#include "platform/profile_text.h"
#include "report/zip_names.h"

// A head and a unit, with a NUL between them: the head, followed by as many units as make a large
// text, is read by every parser. Work that grows with the square of the length is far above the
// limit; work that grows with the length is far below it, also with sanitizers. The time is that of
// the processor, so that a busy machine does not matter.

template <typename Work>
static void RequireQuick(Work work, int line = __builtin_LINE()) {
  const std::clock_t begin = std::clock();
  work();
  Require(std::clock() - begin < CLOCKS_PER_SEC / 2, line);
}

void CheckInput(const std::string& input) {
  // No such folder: what is parsed of an argument is of interest here, not the files.
  ::setenv("ORX_COMMON_APPDATA", "/no/folder", /*overwrite=*/1);
  constexpr size_t fileSize = 256 * 1024;
  constexpr size_t argumentSize = 128 * 1024;  // more than a system takes
  const std::vector<std::string> parts = Split(input, '\0');
  std::string text = parts.size() > 1 ? parts.front() : "";
  while (text.size() < fileSize && !parts.back().empty()) {
    text += parts.back();
  }
  RequireQuick([&] {
    ProfileText profile(text);
    profile.SectionNames();
    profile.Find("x", "Count");
    profile.Set("History", "Count", "1");
  });
  RequireQuick([&] {
    RegistryExport registry(ReaderOf(text));
    registry.SubKeyNames("");
    registry.ValueNames("a");
    registry.Read("a\\b", "a", 100);
  });
  const std::string argument = text.substr(0, argumentSize);
  RequireQuick([&] { LeadsElsewhere(argument); });
  RequireQuick([&] { ReplaceExtension(TrimHead(TrimTail(argument)), ".zip"); });
  RequireQuick([&] { CIniFile(GetHistoryFilePath()).WriteString(argument, "Key", argument); });
}
