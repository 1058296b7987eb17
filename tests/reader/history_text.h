#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <set>
#include <sstream>
#include <string>

#include "reader/check.h"
#include "reader/history.h"
#include "tests/support/file_text.h"

constexpr const char* startTime = "20261114 22:00:03";
constexpr const char* endTime = "20261114 22:41:55";

// The golden report of event 42 with these times: two in its start and its result block, then two.
inline std::string GoldenReport() {
  const std::string text = Golden("ORXInstallEvent.Log");
  const size_t ends = text.find("End   Time");
  return Replaced(text.substr(0, ends), "<time>", startTime) +
         Replaced(text.substr(ends), "<time>", endTime);
}

// The lines of a text, sorted, each with its line feed.
inline std::multiset<std::string> SortedLines(const std::string& text) {
  std::multiset<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) {
    lines.insert(line + '\n');
  }
  return lines;
}

// The history of a folder or an archive, or one event of it.
struct HistoryOf {
  explicit HistoryOf(const std::string& path, const std::optional<std::string>& identity = {}) {
    std::string error;
    From = OpenSource(path, error);
    EXPECT_EQ(error, "");
    Result = From ? ReadHistory(*From, TextDecoder(), Detail::kAll, identity) : History();
  }

  // "level code event: text" for each finding in the source and then in the events, a line each.
  std::string Findings() const {
    std::string lines;
    for (const FindingList& list : {From->Findings, CheckHistory(Result)}) {
      for (const auto& [level, code, event, text] : list) {
        lines.append(LevelName(level)).append(" ").append(code).append(" ");
        lines.append(event).append(": ").append(text).append("\n");
      }
    }
    return lines;
  }

  std::unique_ptr<Source> From;
  History Result;
};

// "added section path/name|field before > after" for each change, a line each, with "-" for
// nothing.
inline std::string ChangeLines(const Changes& changes) {
  std::string text;
  for (const auto& [kind, section, path, name, fields] : changes.List) {
    text.append(ChangeName(kind)).append(" ").append(SectionName(section)).append(" ");
    for (const std::string& part : path) {
      text += part + '/';
    }
    text += name;
    for (const auto& [field, before, after] : fields) {
      text.append("|").append(field).append(" ").append(before.value_or("-"));
      text.append(" > ").append(after.value_or("-"));
    }
    text += '\n';
  }
  return text;
}
