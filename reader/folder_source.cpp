#include <deque>

#include "platform/folder_listing.h"
#include "platform/path.h"
#include "platform/shared_file.h"
#include "reader/history_folder.h"
#include "reader/source.h"

namespace {

class FolderSource : public Source {
 public:
  explicit FolderSource(const std::string& folder);

 protected:
  std::optional<std::string> ReadBytes(size_t file, std::string& reason) override;

 private:
  bool AddFilesOf(const std::string& path, std::deque<std::string>& folders);
  std::string PathOf(const std::string& path) const;

  std::string Folder;
  std::vector<std::string> Paths;  // by SourceFile::Entry, below Folder
};

// Breadth first, so that at the limit the deepest files are left out.
FolderSource::FolderSource(const std::string& folder) : Folder(folder) {
  for (std::deque<std::string> folders = {""}; !folders.empty(); folders.pop_front()) {
    const std::string path = folders.front();
    if (!AddFilesOf(path, folders)) {
      Findings.push_back({FindingLevel::kError, "damaged", "",
                          "The folder holds more than " + std::to_string(kMostFiles) +
                              " files and folders; the others are left out."});
      break;
    }
  }
}

// Adds what is in one folder, whose path is empty or ends in a '/'. False at the limit.
bool FolderSource::AddFilesOf(const std::string& path, std::deque<std::string>& folders) {
  for (const FolderEntry& entry : ListFolder(PathOf(path))) {
    if (entry.Name == "." || entry.Name == "..") {
      continue;
    }
    if (Paths.size() + folders.size() >= kMostFiles) {
      return false;
    }
    const std::string name = path + entry.Name;
    if (name.size() > kMostBytesOfName) {
      continue;
    }
    if ((entry.Attributes & kFolderAttribute) != 0) {
      folders.push_back(name + '/');
    } else {
      Files.push_back({name, entry.Size, Paths.size()});
      Paths.push_back(name);
    }
  }
  return true;
}

std::string FolderSource::PathOf(const std::string& path) const {
  return path.empty() ? Folder : JoinPath(Folder, path);
}

std::optional<std::string> FolderSource::ReadBytes(size_t file, std::string& reason) {
  const SharedFile bytes(PathOf(Paths[Files[file].Entry]), LinkPolicy::kRefuse);
  // It may have grown since it was listed.
  if (!bytes.IsOpen() || bytes.Size() > kMostBytesOfFile) {
    reason = bytes.IsOpen() ? "has grown too large" : "cannot be read";
    return std::nullopt;
  }
  std::string text(static_cast<size_t>(bytes.Size()), '\0');
  text.resize(bytes.ReadAt(0, text.data(), text.size()));
  return text;
}

}  // namespace

std::unique_ptr<Source> OpenFolder(const std::string& path, std::string& error) {
  auto source = std::make_unique<FolderSource>(path);
  if (!KeepHistory(source->Files, source->Findings)) {
    error = "holds no history; name an archive or the folder of a history";
    return nullptr;
  }
  return source;
}
