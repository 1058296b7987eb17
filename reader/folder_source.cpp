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

  // Keeps the files of the history. False if there is none.
  bool FindHistory();

 protected:
  std::optional<std::string> ReadBytes(size_t file, std::string& reason) override;

 private:
  bool AddFilesOf(const std::string& path, std::deque<std::string>& folders);

  std::string Folder;
  size_t FolderCount = 1;
  size_t BytesOfNames = 0;
  size_t LongNames = 0;
};

// Breadth first, so that at the limit the deepest files are left out.
FolderSource::FolderSource(const std::string& folder) : Folder(folder) {
  for (std::deque<std::string> folders = {""}; !folders.empty(); folders.pop_front()) {
    const std::string path = folders.front();
    if (!AddFilesOf(path, folders)) {
      Findings.Add({FindingLevel::kError, "damaged", "",
                    "The folder holds more than " + std::to_string(Files.size() + FolderCount) +
                        " files and folders; the others are left out."});
      break;
    }
  }
  if (LongNames > 0) {
    Findings.Add({FindingLevel::kError, "damaged", "",
                  "Files and folders left out, as their paths have more than " +
                      std::to_string(kMostBytesOfName) + " bytes: " + std::to_string(LongNames) +
                      "."});
  }
}

// Adds what is in one folder, whose path is empty or ends in a '/'. False at the limit.
bool FolderSource::AddFilesOf(const std::string& path, std::deque<std::string>& folders) {
  for (const FolderEntry& entry : ListFolder(path.empty() ? Folder : JoinPath(Folder, path))) {
    if (entry.Name == "." || entry.Name == "..") {
      continue;
    }
    const std::string name = path + entry.Name;
    if (name.size() > kMostBytesOfName) {
      ++LongNames;
      continue;
    }
    BytesOfNames += name.size();
    if (Files.size() + FolderCount >= kMostFiles || BytesOfNames > kMostBytesOfNames) {
      return false;
    }
    if ((entry.Attributes & kFolderAttribute) != 0) {
      folders.push_back(name + '/');
      ++FolderCount;
    } else {
      Files.push_back({name, entry.Size});
    }
  }
  return true;
}

bool FolderSource::FindHistory() {
  const std::optional<std::string> below = KeepHistory(Files, Findings);
  if (below && !below->empty()) {
    Folder = JoinPath(Folder, *below);
  }
  return below.has_value();
}

// What a file has grown by since it was listed is not read.
std::optional<std::string> FolderSource::ReadBytes(size_t file, std::string& reason) {
  const SharedFile bytes(JoinPath(Folder, Files[file].Path), LinkPolicy::kRefuse);
  if (!bytes.IsOpen()) {
    reason = "cannot be read";
    return std::nullopt;
  }
  std::string text(static_cast<size_t>(Files[file].Size), '\0');
  text.resize(bytes.ReadAt(0, text.data(), text.size()));
  return text;
}

}  // namespace

std::unique_ptr<Source> OpenFolder(const std::string& path, std::string& error) {
  auto source = std::make_unique<FolderSource>(path);
  if (!source->FindHistory()) {
    error = "holds no history; name an archive or the folder of a history";
    return nullptr;
  }
  return source;
}
