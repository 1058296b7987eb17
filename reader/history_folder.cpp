#include "reader/history_folder.h"

#include <algorithm>
#include <string_view>
#include <tuple>

#include "platform/ascii_case.h"
#include "reader/text_encoding.h"

namespace {

// With the '/' after it; empty for the top.
std::string_view FolderOf(std::string_view path) { return path.substr(0, path.rfind('/') + 1); }

bool IsNamed(std::string_view path, std::string_view name) {
  return EqualsIgnoringCase(path.substr(path.rfind('/') + 1), name);
}

bool IsHistoryFolder(std::string_view folder) {
  return folder.ends_with('/') && IsNamed(folder.substr(0, folder.size() - 1), "ORXHistory");
}

// The lower, the better.
std::tuple<int, ptrdiff_t> RankOf(std::string_view folder) {
  return {folder.empty()            ? 0
          : IsHistoryFolder(folder) ? 1
                                    : 2,
          std::count(folder.begin(), folder.end(), '/')};
}

std::optional<std::string_view> FolderWithHistoryFile(const std::vector<SourceFile>& files) {
  std::optional<std::string_view> best;
  for (const SourceFile& file : files) {
    if (IsNamed(file.Path, "History.ini")) {
      const std::string_view folder = FolderOf(file.Path);
      best = !best || RankOf(folder) < RankOf(*best) ? folder : *best;
    }
  }
  return best;
}

std::optional<std::string_view> FolderWithReports(const std::vector<SourceFile>& files) {
  std::optional<std::string_view> top;
  for (const SourceFile& file : files) {
    if (!IsNamed(file.Path, "ORXInstallEvent.Log")) {
      continue;
    }
    top = "";
    for (std::string_view folder = FolderOf(file.Path); !folder.empty();
         folder = FolderOf(folder.substr(0, folder.size() - 1))) {
      if (IsHistoryFolder(folder)) {
        return folder;
      }
    }
  }
  return top;
}

bool HasHiddenPart(std::string_view path) {
  return path.starts_with('.') || path.find("/.") != std::string_view::npos;
}

}  // namespace

std::optional<std::string> KeepHistory(std::vector<SourceFile>& files, FindingList& findings) {
  std::optional<std::string_view> best = FolderWithHistoryFile(files);
  if (!best) {
    best = FolderWithReports(files);
  }
  if (!best) {
    return std::nullopt;
  }
  const std::string folder(*best);
  const auto isBelow = [&](const SourceFile& file) { return file.Path.starts_with(folder); };
  const auto others = std::count_if(files.begin(), files.end(), [&](const SourceFile& file) {
    return !isBelow(file) && IsNamed(file.Path, "History.ini");
  });
  if (others > 0) {
    findings.Add({FindingLevel::kWarning, "damaged", "",
                  "More than one history is here; the one in " +
                      (folder.empty() ? "the top folder" : TextDecoder().ToUtf8(folder)) +
                      " is read."});
  }
  std::erase_if(files, [&](const SourceFile& file) { return !isBelow(file); });
  for (SourceFile& file : files) {
    file.Path.erase(0, folder.size());
  }
  std::erase_if(files, [](const SourceFile& file) { return HasHiddenPart(file.Path); });
  return folder;
}
