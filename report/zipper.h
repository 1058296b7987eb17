#pragma once

#include <minizip/zip.h>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "platform/exclusive_file.h"
#include "platform/folder_listing.h"
#include "platform/temporary_file.h"

struct ZipFileInfo {
  uint32_t FileCount = 0;         // entries begun for files and buffers
  uint32_t FolderCount = 0;       // AddFolder calls, for folders within folders too
  uint32_t UncompressedSize = 0;  // bytes written to entries, modulo 4 GiB
};

// What minizip 1.1 can store so that other programs read it. It reserves no space for sizes of 64
// bits, so the size of an entry must stay below 4 GiB - 1, compressed as well: what cannot be
// compressed becomes 0.031 percent larger. And it writes the end record that can count more entries
// only for an archive of 4 GiB or more.
struct ZipLimits {
  uint64_t EntrySize = 0xFFE00000;  // bytes of a file that are stored: 2 MiB less than 4 GiB
  uint32_t Entries = 65535;         // files, folders and buffers added since Open
};

// Writes one zip archive at a time. Files are streamed and never held in memory.
//
// A new archive is a TemporaryFile until Close, which renames it over an older one of its name. If
// a write has failed by then, or Close cannot finish the archive, the older one stays. The archive
// must be a regular file, or nothing of its name may exist: a link is not followed. Only its owner
// may read it (on Windows, whoever the folder allows).
//
// A relative path passed to an operation is relative to RootFolder, not to the working directory.
// Entry names are relative to RootFolder, or with ignorePath only the last part of the path; they
// keep the bytes and separators of the path. Entries have the attributes and the last-write time of
// their source; of a time that the format cannot store, the nearest that it can (1980 to 2107).
// A folder's entry is marked by its attributes, not by a separator at the end of its name.
//
// An operation returns true if it worked, and false without an open archive. These add nothing: a
// file that cannot be opened for exclusive reading, a link, a pipe, a device, the archive itself,
// the older archive that it is to replace, and an entry beyond Limits.Entries. A file is stored up
// to the size that it had when it was opened, at most Limits.EntrySize; up to where it is cut or
// cannot be read, if that comes first.
//
// ZipFolder, ZipFile, AddFileWithFolder, AddBuffer, GetFileInfo and append belong to the interface;
// the tool itself does not use them.
class CZipper {
 public:
  explicit CZipper(const char* archivePath = nullptr, const char* rootFolder = nullptr,
                   bool append = false);
  virtual ~CZipper();
  CZipper(const CZipper&) = delete;
  CZipper& operator=(const CZipper&) = delete;

  // Closes what was open and begins the archive, which replaces an older file of its name. With
  // append, entries are added to the existing file itself. Without a root folder it is the
  // archive's own folder. False if the archive cannot be created or must not be replaced.
  bool Open(const char* archivePath, const char* rootFolder = nullptr, bool append = false);

  // Ends the archive. False if that or an earlier write failed; without append the file of the
  // archive's name is then as it was before Open. True also when nothing was open. Counters stay
  // until the next Open.
  bool Close();

  // False if a limit was met since the last Open: then the archive is readable, but a file in it is
  // cut, or an entry is missing.
  bool IsWithinLimits() const { return WithinLimits; }

  // Unless the path is ignored, a rooted one must begin with RootFolder, and a relative one must
  // not begin with "..". The entry is never marked read-only.
  bool AddFile(const std::string& path, bool ignorePath = false);

  // Adds the folder's entry (RootFolder itself has none) and then its contents, in ListFolder
  // order; what fails is skipped, and so are names that begin with a dot.
  bool AddFolder(const std::string& path, bool ignorePath = false);

  // Adds the file under its base name in a folder of the archive, which must not be rooted.
  bool AddFileWithFolder(const std::string& path, const std::string& folder);

  // Adds memory as an entry of that name, which must not be rooted; dated now, in UTC.
  bool AddBuffer(const void* data, uint32_t size, const std::string& name);

  void GetFileInfo(ZipFileInfo& info) const;

  // Packs a folder, or a file, into an archive beside it: "data" into "data.zip", "a.txt" into
  // "a.zip". False if the archive cannot be opened or the folder or file is refused.
  static bool ZipFolder(const std::string& folder, bool ignorePath);
  static bool ZipFile(const std::string& path);

  zipFile ZipHandle = nullptr;  // of the open archive, else null
  std::string RootFolder;       // without a separator at its end; empty without an open archive
  ZipFileInfo Counters;

  ZipLimits Limits;

  // A file that other processes change under its ProfileGuard: it is packed while this process has
  // the guard. Empty for none.
  std::string GuardedFile;

 private:
  std::string SourcePath(const std::string& path) const;
  std::optional<std::string> FileEntryName(const std::string& path, bool ignorePath) const;

  // False if minizip reports an error or the archive is full; then nothing can be written.
  bool BeginEntry(const std::string& name, uint32_t attributes, const CalendarTime& time);
  bool WriteToEntry(std::string_view bytes);
  void EndEntry();

  void AddContents(const std::string& folder, bool ignorePath);
  bool PackFile(const std::string& source, const std::string& name, uint32_t attributes);
  bool CopyToEntry(ExclusiveFile& file);

  std::string ArchivePath;                  // absolute
  std::optional<TemporaryFile> NewArchive;  // without append, until Close
  uint32_t EntryCount = 0;
  bool IsWritten = false;  // no call of minizip has failed since Open
  bool WithinLimits = true;
};
