#include "reader/history_files.h"

#include <algorithm>

#include "platform/ascii_case.h"

HistoryFiles::HistoryFiles(const Source& source, const TextDecoder& decoder)
    : From(source), Decoder(decoder) {
  for (size_t i = 0; i < source.Files.size(); ++i) {
    std::string path = PathOf(i);
    ByLoweredPath.try_emplace(LoweredAscii(path), i);
    ByPath.try_emplace(std::move(path), i);
  }
}

std::string HistoryFiles::PathOf(size_t file) const {
  return Decoder.ToUtf8(From.Files[file].Path);
}

std::optional<size_t> HistoryFiles::Look(const Index& index, const std::string& path) {
  const auto found = index.find(path);
  return found == index.end() ? std::nullopt : std::optional(found->second);
}

std::optional<size_t> HistoryFiles::Find(std::string_view path) const {
  return Look(ByPath, std::string(path));
}

std::optional<size_t> HistoryFiles::FindIgnoringCase(std::string_view path) const {
  return Look(ByLoweredPath, LoweredAscii(path));
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
