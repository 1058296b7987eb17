#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "reader/archive.h"
#include "reader/finding.h"
#include "reader/limits.h"

// The folder or archive that a history is read from. Nothing is written there and no lock is taken.
// What exceeds the limits of reader/limits.h is left out, with a finding.

struct SourceFile {
  std::string Path;   // below the folder of the history: raw bytes, parts joined by '/'
  uint64_t Size = 0;  // in bytes, as the folder or the archive says
  size_t Entry = 0;   // its index in the archive
};

class Source {
 public:
  virtual ~Source() = default;

  // The raw bytes of Files[file]; nothing, and a finding, if they cannot be read to their end, are
  // more than the limit, or exceed kMostBytesRead with those that were read before.
  std::optional<std::string> Read(size_t file, uint64_t most = kMostBytesOfFile);

  std::string Name;                   // as the user gave it, UTF-8
  std::vector<SourceFile> Files;      // regular files; no links, no names that begin with a dot
  FindingList Findings;               // what was left out or is damaged
  std::function<void()> OnRead = {};  // called after each read

 protected:
  // At most Files[file].Size bytes. A failure leaves its reason as the end of a sentence that
  // begins with the name of the file.
  virtual std::optional<std::string> ReadBytes(size_t file, std::string& reason) = 0;

 private:
  std::string WhyNotRead(size_t file, uint64_t most) const;

  uint64_t BytesRead = 0;
};

// Opens the history in a folder or an archive, wherever in it History.ini is; without that file,
// where the reports of events are. Nothing, and in the text one line that says what is wrong and
// what to do, if there is none. An archive's own path may be a link; below a folder none is
// followed.
std::unique_ptr<Source> OpenSource(const std::string& path, std::string& error);

// The bytes of an archive. Nothing, and the reason as the end of a sentence that begins with the
// path, if it is no regular file or cannot be opened.
std::optional<ArchiveBytes> OpenArchiveFile(const std::string& path, std::string& error);

// As OpenSource for a history folder or a folder above one, and for the bytes of an archive; the
// error is the end of a sentence.
std::unique_ptr<Source> OpenFolder(const std::string& path, std::string& error);
std::unique_ptr<Source> OpenArchive(const ArchiveBytes& bytes, std::string& error);
