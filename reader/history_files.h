#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>

#include "reader/source.h"
#include "reader/text_encoding.h"

// Finds the files of a source by their paths. All paths are UTF-8 with parts joined by '/', so that
// a path in the history file and the name in an archive agree whatever their encodings are.
class HistoryFiles {
 public:
  HistoryFiles(const Source& source, const TextDecoder& decoder);

  // The index in Source::Files; nothing if there is no such file.
  std::optional<size_t> Find(std::string_view path) const;
  std::optional<size_t> FindIgnoringCase(std::string_view path) const;

  // The file that had this full path on the machine that wrote the history, of any system. The case
  // of letters does not count for a path of Windows.
  std::optional<size_t> FindNamed(std::string_view fullPath) const;

  // The path of Source::Files[file] as UTF-8.
  std::string PathOf(size_t file) const;

 private:
  using Index = std::unordered_map<std::string, size_t>;
  static std::optional<size_t> Look(const Index& index, const std::string& path);

  const Source& From;
  const TextDecoder& Decoder;
  Index ByPath;
  Index ByLoweredPath;  // of those that differ in case alone the first
};

// The part of a path of any system after its last separator.
std::string LastPart(std::string_view path);
