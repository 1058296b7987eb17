#include <filesystem>

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

struct Tree : ScratchHistory {
  Tree() {
    Make("tree/file.txt");
    Make("ZEK/ORXHistory/C1/42/");
    std::filesystem::create_symlink(Root, InHistory("C1/link"));
  }
};

void CheckParts(const std::string& path) {
  const std::string folder = FolderPart(path);
  const std::string name = BaseName(path);
  Require(folder + name == path && JoinPath(folder, name) == path);
  Require(folder.empty() || folder.back() == '/');
  Require(name.find('/') == std::string::npos && BaseName(name) == name);

  const std::string packed = ReplaceExtension(path, ".zip");
  Require(FolderPart(packed) == folder && packed.ends_with(".zip"));
  const std::string stem = BaseName(packed).substr(0, BaseName(packed).size() - 4);
  Require(name.starts_with(stem));
  Require(name == stem || name.rfind('.') == stem.size());
  Require(ReplaceExtension(packed, ".zip") == packed);
}

std::string Reversed(const std::string& text) { return {text.rbegin(), text.rend()}; }

void CheckTrimming(const std::string& text) {
  const size_t word = std::min(text.find_first_not_of(" \t\n\v\f\r"), text.size());
  const size_t name = std::min(text.find_first_not_of('/', word), text.size());
  Require(TrimHead(text) == text.substr(name));
  // The tail is trimmed in the same way, but the first character stays.
  const size_t first = std::min<size_t>(text.size(), 1);
  Require(TrimTail(text) ==
          text.substr(0, first) + Reversed(TrimHead(Reversed(text.substr(first)))));
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
  const bool leadsOut = LeadsElsewhere(name);
  const std::filesystem::path path = JoinPath(GetHistoryDir(), name);
  Require(leadsOut || (path.lexically_normal().string() + '/').starts_with(GetHistoryDir() + '/'));
  const auto parts = Split(name, '/');
  Require(leadsOut || std::count(parts.begin(), parts.end(), "..") == 0);
  Require(leadsOut || !name.starts_with('/'));
  Require(leadsOut || !(name + '/').starts_with("C1/link/"));
}

void CheckArchive(const std::string& root, const std::string& path, const std::string& second) {
  const std::string archivePath = root + "/a.zip";
  const std::string source = root + "/tree/file.txt";
  CZipper zipper(archivePath.c_str(), (root + "/tree").c_str());
  std::vector<std::string> expected;
  const auto expect = [&expected](bool isAdded, const std::string& name) {
    if (isAdded) {
      expected.push_back(TrimHead(TrimTail(name)));
    }
  };
  expect(zipper.AddBuffer("x", 1, path), path);
  expect(zipper.AddFileWithFolder(source, second), JoinPath(second, "file.txt"));
  Require(zipper.AddFile(source));
  expected.emplace_back("file.txt");
  Require(zipper.Counters.FileCount == expected.size());
  Require(zipper.Close());
  const std::vector<ArchiveEntry> entries = ReadArchive(archivePath);
  Require(std::equal(entries.begin(), entries.end(), expected.begin(), expected.end(),
                     [](const ArchiveEntry& entry, const std::string& name) {
                       return entry.IsWhole && entry.Name == name && !name.starts_with('/');
                     }));
}

}  // namespace

void CheckInput(const std::string& input) {
  static const Tree tree;
  std::vector<std::string> paths = Split(input, '\0');
  paths.resize(2);
  for (const std::string& path : paths) {
    CheckParts(path);
    CheckTrimming(path);
    CheckStaying(path);
  }
  CheckJoining(paths[0], paths[1]);
  if (input.size() % 16 == 0) {
    CheckArchive(tree.Root, paths[0], paths[1]);
  }
}
