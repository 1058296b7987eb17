#include "reader/unpack.h"

#include <algorithm>
#include <string_view>

#include "platform/files.h"
#include "platform/new_file.h"
#include "platform/path.h"
#include "reader/archive.h"
#include "reader/archive_names.h"
#include "reader/limits.h"
#include "reader/source.h"
#include "reader/text_encoding.h"

namespace {

// The path with this system's separators; empty if a part of it would be something else here.
std::string NativePath(std::string_view path) {
  std::string native;
  for (size_t begin = 0; begin <= path.size();) {
    const size_t end = std::min(path.find('/', begin), path.size());
    const std::string_view part = path.substr(begin, end - begin);
    if (!IsKeptName(part) || FindSeparator(part) != std::string_view::npos) {
      return "";
    }
    native += (begin == 0 ? "" : std::string(1, kPathSeparator)) + std::string(part);
    begin = end + 1;
  }
  return native;
}

// Makes the folder and those above it up to the root, which exists. False if one cannot be made or
// is a link.
bool MakeFolders(const std::string& root, const std::string& folder) {
  for (size_t begin = 0; begin < folder.size();) {
    const size_t end = std::min(FindSeparator(folder, begin), folder.size());
    const std::string path = JoinPath(root, folder.substr(0, end));
    CreateFolder(path);
    if (IsSymbolicLink(path) || KindOf(path) != FileKind::kFolder) {
      return false;
    }
    begin = end + 1;
  }
  return true;
}

class Unpacking {
 public:
  Unpacking(Archive& archive, const std::string& root, UnpackResult& result)
      : Zip(archive), Root(root), Result(result) {}

  void Restore(const ArchiveEntry& entry) {
    std::string reason;
    if (!TryToRestore(entry, reason)) {
      Result.LeftOut.push_back(TextDecoder().ToUtf8(entry.Path) + " " + reason + ".");
    }
  }

 private:
  bool TryToRestore(const ArchiveEntry& entry, std::string& reason) {
    const std::string path = HasPlainParts(entry.Path) ? NativePath(entry.Path) : "";
    reason = path.empty()   ? "leads out of the folder or is no name here"
             : entry.IsLink ? "is a link"
                            : "cannot be made: a folder above it is a link or a file";
    if (path.empty() || entry.IsLink ||
        !MakeFolders(Root, entry.IsFolder ? path : FolderPart(path))) {
      return false;
    }
    return entry.IsFolder || RestoreFile(entry, JoinPath(Root, path), reason);
  }

  bool RestoreFile(const ArchiveEntry& entry, const std::string& path, std::string& reason) {
    NewFile file(path);
    if (!file.IsOpen()) {
      reason = KindOf(path) == FileKind::kNone && !IsSymbolicLink(path) ? "cannot be made"
                                                                        : "is there already";
      return false;
    }
    bool isWritten = true;
    const auto write = [&](std::string_view piece) {
      BytesWritten += piece.size();
      isWritten = BytesWritten <= kMostBytesUnpacked && file.Write(piece);
      return isWritten;
    };
    if (!Zip.Unpack(entry, write, reason) || !file.Finish()) {
      reason = isWritten ? reason : "cannot be written: the disk is full or the archive too large";
      return false;
    }
    ++Result.Restored;
    return true;
  }

  Archive& Zip;
  const std::string& Root;
  UnpackResult& Result;
  uint64_t BytesWritten = 0;
};

}  // namespace

UnpackResult UnpackArchive(const std::string& archive, const std::string& folder,
                           const std::function<void()>& onFile) {
  UnpackResult result;
  std::optional<ArchiveBytes> bytes = OpenArchiveFile(archive, result.Error);
  std::unique_ptr<Archive> zip = bytes ? Archive::Open(*bytes, result.Error) : nullptr;
  if (!zip) {
    result.Error = TextDecoder().ToUtf8(SystemTextToUtf8(archive)) + " " + result.Error + ".";
    return result;
  }
  CreateFolder(folder);
  if (KindOf(folder) != FileKind::kFolder) {
    result.Error =
        TextDecoder().ToUtf8(SystemTextToUtf8(folder)) + " cannot be made; name another folder.";
    return result;
  }
  result.IsDone = true;
  result.LeftOut = zip->Complaints();
  Unpacking unpacking(*zip, folder, result);
  for (const ArchiveEntry& entry : zip->Entries()) {
    unpacking.Restore(entry);
    onFile();
  }
  return result;
}
