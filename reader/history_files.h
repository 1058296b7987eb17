#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

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
  const std::string& PathOf(size_t file) const { return Paths[file]; }

 private:
  std::vector<std::string> Paths;     // of the files of the source
  std::vector<size_t> ByPath;         // files, sorted
  std::vector<size_t> ByLoweredPath;  // without case; paths that differ only in it, by number
};

// The part of a path of any system after its last separator.
std::string LastPart(std::string_view path);
