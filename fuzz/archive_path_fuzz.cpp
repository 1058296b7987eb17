#include <algorithm>
#include <cctype>
#include <cstdint>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include "fuzz/support.h"
#include "history/locations.h"
#include "platform/path.h"
#include "report/zip_names.h"
#include "report/zipper.h"
#include "tests/support/archive_reader.h"
#include "tests/support/scratch_history.h"

// A path and a second one, with a NUL between them: how they are split and joined, whether they
// stay below the history folder, and, for one input in sixteen, the names of archive entries made
// of them.

namespace {

namespace fs = std::filesystem;

bool IsBlank(char c) { return c == ' ' || (c >= '\t' && c <= '\r'); }
bool IsSlash(char c) { return c == '/'; }

void CheckParts(const std::string& path) {
  const std::string folder = FolderPart(path);
  const std::string name = BaseName(path);
  Require(folder + name == path && JoinPath(folder, name) == path);
  Require(folder.empty() || folder.back() == '/');
  Require(name.find('/') == std::string::npos && BaseName(name) == name);

  const std::string packed = ReplaceExtension(path, ".zip");
  Require(FolderPart(packed) == folder && packed.ends_with(".zip"));
  Require(name.starts_with(packed.substr(folder.size(), packed.size() - folder.size() - 4)));
  Require(ReplaceExtension(packed, ".zip") == packed);
}

void CheckTrimming(const std::string& text) {
  const auto word = std::find_if_not(text.begin(), text.end(), IsBlank);
  Require(TrimHead(text) == std::string(std::find_if_not(word, text.end(), IsSlash), text.end()));

  const std::string kept = TrimTail(text);
  Require(text.starts_with(kept));
  Require(kept.size() <= 1 || !kept.ends_with('/'));
  // What was removed is slashes and then blanks.
  const auto rest = text.begin() + static_cast<ptrdiff_t>(kept.size());
  const auto blanks = std::find_if_not(rest, text.end(), IsSlash);
  Require(std::all_of(blanks, text.end(), IsBlank));
}

void CheckJoining(const std::string& folder, const std::string& name) {
  const std::string path = JoinPath(folder, name);
  Require(path.starts_with(folder) && path.ends_with(name));
  Require(path.size() <= folder.size() + name.size() + 1);
  Require(CutFolder(path, folder) == path.substr(folder.size()));
  Require(CutFolder(folder, path).has_value() == (path == folder));
  const std::optional<std::string> cut = CutFolder(name, folder);
  Require(!cut || (cut->size() + folder.size() == name.size() && name.ends_with(*cut)));
}

void CheckStaying(const std::string& name) {
  const std::string history = GetHistoryDir();
  const bool leadsOut = LeadsElsewhere(name);
  const auto parts = Split(name, '/');
  const bool isPlain = std::none_of(parts.begin(), parts.end(),
                                    [](const std::string& part) { return part == ".."; });
  if (name.find('\0') == std::string::npos && !leadsOut) {
    const std::string place = fs::path(JoinPath(history, name)).lexically_normal().string() + '/';
    Require(place.starts_with(history + '/'));
  }
  Require(leadsOut || (isPlain && !name.starts_with('/')));
  Require(leadsOut || (name != "C1/link" && !name.starts_with("C1/link/")));
}

std::string TrimmedName(const std::string& name) { return TrimHead(TrimTail(name)); }

void CheckArchive(const std::string& root, const std::string& path, const std::string& second) {
  const std::string archivePath = root + "/a.zip";
  const std::string source = root + "/tree/file.txt";
  std::vector<std::string> expected;
  CZipper zipper(archivePath.c_str(), (root + "/tree").c_str());
  if (zipper.AddBuffer("x", 1, path)) {
    expected.push_back(TrimmedName(path));
  }
  if (zipper.AddFileWithFolder(source, second)) {
    expected.push_back(TrimmedName(JoinPath(second, "file.txt")));
  }
  Require(zipper.AddFile(source));
  expected.push_back("file.txt");
  Require(zipper.Counters.FileCount == expected.size());
  Require(zipper.Close());
  std::vector<std::string> names;
  for (const ArchiveEntry& entry : ReadArchive(archivePath)) {
    Require(entry.IsWhole);
    names.push_back(entry.Name);
  }
  Require(names == expected);
  Require(std::none_of(expected.begin(), expected.end(),
                       [](const std::string& name) { return name.starts_with('/'); }));
}

struct Tree {
  Tree() {
    fs::create_directory(History.Root + "/tree");
    fs::create_directories(JoinPath(GetHistoryDir(), "C1/42"));
    fs::create_symlink(History.Root, JoinPath(GetHistoryDir(), "C1/link"));
    WriteFileText(History.Root + "/tree/file.txt", "text");
  }

  ScratchHistory History;
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const Tree tree;
  std::vector<std::string> paths = Split(std::string(data, data + size), '\0');
  paths.resize(2);
  for (const std::string& path : paths) {
    CheckParts(path);
    CheckTrimming(path);
    CheckStaying(path);
  }
  CheckJoining(paths[0], paths[1]);
  if (size % 16 == 0) {
    CheckArchive(tree.History.Root, paths[0], paths[1]);
  }
  return 0;
}
