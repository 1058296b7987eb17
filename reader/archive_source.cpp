#include <string_view>
#include <unordered_set>

#include "reader/archive.h"
#include "reader/archive_names.h"
#include "reader/history_folder.h"
#include "reader/source.h"

namespace {

class ArchiveSource : public Source {
 public:
  explicit ArchiveSource(std::unique_ptr<Archive> archive);

 protected:
  std::optional<std::string> ReadBytes(size_t file, std::string& reason) override;

 private:
  std::unique_ptr<Archive> Zip;
};

ArchiveSource::ArchiveSource(std::unique_ptr<Archive> archive) : Zip(std::move(archive)) {
  for (const std::string& complaint : Zip->Complaints()) {
    Findings.Add({FindingLevel::kError, "damaged", "", complaint});
  }
  std::unordered_set<std::string_view> seen;
  size_t refused = 0;
  const std::vector<ArchiveEntry>& entries = Zip->Entries();
  for (size_t i = 0; i < entries.size(); ++i) {
    const ArchiveEntry& entry = entries[i];
    if (entry.IsFolder || entry.IsLink) {
      continue;
    }
    if (HasPlainParts(entry.Path) && seen.insert(entry.Path).second) {
      Files.push_back({entry.Path, entry.Size, i});
    } else {
      ++refused;
    }
  }
  if (refused > 0) {
    Findings.Add({FindingLevel::kWarning, "damaged", "",
                  "Entries left out, as their names lead out of the archive's folder, are no "
                  "names, or are there twice: " +
                      std::to_string(refused) + "."});
  }
}

std::optional<std::string> ArchiveSource::ReadBytes(size_t file, std::string& reason) {
  std::string bytes;
  bytes.reserve(static_cast<size_t>(Files[file].Size));
  const bool isWhole = Zip->Unpack(
      Zip->Entries()[Files[file].Entry],
      [&](std::string_view piece) {
        bytes += piece;
        return true;
      },
      reason);
  return isWhole ? std::optional(std::move(bytes)) : std::nullopt;
}

}  // namespace

std::unique_ptr<Source> OpenArchive(const ArchiveBytes& bytes, std::string& error) {
  std::unique_ptr<Archive> archive = Archive::Open(bytes, error);
  if (!archive) {
    return nullptr;
  }
  auto source = std::make_unique<ArchiveSource>(std::move(archive));
  if (!KeepHistory(source->Files, source->Findings)) {
    error = "holds no history; name an archive that the report made";
    return nullptr;
  }
  return source;
}
