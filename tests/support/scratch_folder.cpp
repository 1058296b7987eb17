#include "tests/support/scratch_folder.h"

#include <filesystem>
#include <numeric>
#include <random>
#include <set>

#include "platform/path.h"

namespace fs = std::filesystem;

ScratchFolder::ScratchFolder() {
  const auto name = "orx-test-" + std::to_string(std::random_device()());
  Root = (fs::temp_directory_path() / name).string();
  fs::create_directory(Root);
}

ScratchFolder::~ScratchFolder() {
  std::error_code ignored;
  fs::remove_all(Root, ignored);
}

std::string ScratchFolder::In(const std::string& path) const { return Native("@/" + path); }

std::string ScratchFolder::Make(const std::string& path, const std::string& text) const {
  const std::string whole = In(path);
  if (path.ends_with('/')) {
    fs::create_directories(whole);
  } else {
    fs::create_directories(fs::path(whole).parent_path());
    WriteFileText(whole, text);
  }
  return whole;
}

std::string ScratchFolder::Tree() const {
  std::set<std::string> lines;
  for (const auto& entry : fs::recursive_directory_iterator(Root)) {
    const std::string path = entry.path().string().substr(Root.size() + 1);
    lines.insert(Neutral(path) + (entry.is_directory() ? "/\n" : "\n"));
  }
  return std::accumulate(lines.begin(), lines.end(), std::string());
}

std::string ScratchFolder::Neutral(std::string text) const {
  std::erase(text, '\r');
  return WithoutTimes(Replaced(Replaced(text, Root, "@"), {kPathSeparator}, "/"));
}

std::string ScratchFolder::Native(const std::string& text) const {
  return Replaced(Replaced(text, "/", {kPathSeparator}), "@", Root);
}
