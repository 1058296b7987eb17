#include "reader/source.h"

#include "platform/files.h"
#include "platform/shared_file.h"
#include "platform/text_codec.h"
#include "reader/text_encoding.h"

static std::string MebibytesOf(uint64_t bytes) { return std::to_string(bytes >> 20) + " MiB"; }

// Why the file exceeds a limit; empty if it does not.
std::string Source::WhyNotRead(size_t file, uint64_t most) const {
  const uint64_t size = Files[file].Size;
  if (size > most) {
    return "has more than " + MebibytesOf(most);
  }
  if (size > kMostBytesRead - BytesRead) {
    return "is beyond the first " + MebibytesOf(kMostBytesRead) + " of what is read";
  }
  return "";
}

std::optional<std::string> Source::Read(size_t file, uint64_t most) {
  std::string reason = WhyNotRead(file, most);
  std::optional<std::string> bytes;
  if (reason.empty()) {
    bytes = ReadBytes(file, reason);
    BytesRead += Files[file].Size;
  }
  if (!bytes) {
    const std::string name = TextDecoder().ToUtf8(Files[file].Path);
    Findings.Add({FindingLevel::kError, "damaged", "", name + " " + reason + "."});
  }
  if (OnRead) {
    OnRead();
  }
  return bytes;
}

std::optional<ArchiveBytes> OpenArchiveFile(const std::string& path, std::string& error) {
  const auto file = std::make_shared<SharedFile>(path, LinkPolicy::kFollow);
  if (file->IsOpen()) {
    return ArchiveBytes{file->Size(), [file](uint64_t offset, char* buffer, size_t size) {
                          return file->ReadAt(offset, buffer, size);
                        }};
  }
  const FileKind kind = KindOf(path);
  error = kind == FileKind::kNone   ? "is not there; name an archive or a folder"
          : kind == FileKind::kFile ? "cannot be opened; look at its permissions"
                                    : "is no file; name an archive";
  return std::nullopt;
}

static std::unique_ptr<Source> OpenFileOrFolder(const std::string& path, std::string& error) {
  if (KindOf(path) == FileKind::kFolder) {
    return OpenFolder(path, error);
  }
  std::optional<ArchiveBytes> bytes = OpenArchiveFile(path, error);
  return bytes ? OpenArchive(*bytes, error) : nullptr;
}

std::unique_ptr<Source> OpenSource(const std::string& path, std::string& error) {
  std::unique_ptr<Source> source = OpenFileOrFolder(path, error);
  const std::string name = TextDecoder().ToUtf8(SystemTextToUtf8(path));
  if (source) {
    source->Name = name;
  } else {
    error = name + " " + error + ".";
  }
  return source;
}
