#include "reader/history_files.h"

#include <algorithm>
#include <cstdint>
#include <numeric>

#include "platform/ascii_case.h"

namespace {

bool IsBefore(std::string_view a, std::string_view b) { return a < b; }

bool IsBeforeIgnoringCase(std::string_view a, std::string_view b) {
  return std::lexicographical_compare(a.begin(), a.end(), b.begin(), b.end(), [](char x, char y) {
    return static_cast<uint8_t>(ToLowerAscii(x)) < static_cast<uint8_t>(ToLowerAscii(y));
  });
}

template <typename Order>
std::vector<size_t> Sorted(const std::vector<std::string>& paths, Order isBefore) {
  std::vector<size_t> sorted(paths.size());
  std::iota(sorted.begin(), sorted.end(), size_t{0});
  std::stable_sort(sorted.begin(), sorted.end(),
                   [&](size_t a, size_t b) { return isBefore(paths[a], paths[b]); });
  return sorted;
}

// The first file that is neither before nor after the path.
template <typename Order>
std::optional<size_t> Look(const std::vector<size_t>& sorted, const std::vector<std::string>& paths,
                           std::string_view path, Order isBefore) {
  const auto found =
      std::lower_bound(sorted.begin(), sorted.end(), path,
                       [&](size_t file, std::string_view p) { return isBefore(paths[file], p); });
  const bool isFound = found != sorted.end() && !isBefore(path, paths[*found]);
  return isFound ? std::optional(*found) : std::nullopt;
}

}  // namespace

HistoryFiles::HistoryFiles(const Source& source, const TextDecoder& decoder) {
  Paths.reserve(source.Files.size());
  for (const SourceFile& file : source.Files) {
    Paths.push_back(decoder.ToUtf8(file.Path));
  }
  ByPath = Sorted(Paths, IsBefore);
  ByLoweredPath = Sorted(Paths, IsBeforeIgnoringCase);
}

std::optional<size_t> HistoryFiles::Find(std::string_view path) const {
  return Look(ByPath, Paths, path, IsBefore);
}

std::optional<size_t> HistoryFiles::FindIgnoringCase(std::string_view path) const {
  return Look(ByLoweredPath, Paths, path, IsBeforeIgnoringCase);
}

std::optional<size_t> HistoryFiles::FindNamed(std::string_view fullPath) const {
  constexpr std::string_view folder = "/zek/orxhistory/";
  const bool isOfWindows = !fullPath.starts_with('/');
  std::string path(fullPath);
  if (isOfWindows) {
    std::replace(path.begin(), path.end(), '\\', '/');
  }
  const size_t history = LoweredAscii(path).rfind(folder);
  if (history == path.npos) {
    return std::nullopt;
  }
  path.erase(0, history + folder.size());
  const auto found = Find(path);
  return found || !isOfWindows ? found : FindIgnoringCase(path);
}

std::string LastPart(std::string_view path) {
  const size_t separator = path.starts_with('/') ? path.rfind('/') : path.find_last_of("/\\");
  return std::string(path.substr(separator + 1));
}
