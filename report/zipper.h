#pragma once

#include <minizip/zip.h>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "platform/folder_listing.h"

struct ZipFileInfo {
  uint32_t FileCount = 0;         // entries begun for files and buffers
  uint32_t FolderCount = 0;       // AddFolder calls, for folders within folders too
  uint32_t UncompressedSize = 0;  // bytes fed into entries; starts over at 4 GiB
};

// Writes one zip archive at a time. Files are streamed and never held in memory.
//
// A relative path given to an operation lies below RootFolder, not below the working directory.
// Entry names are relative to RootFolder, or with ignorePath the last part of the path alone; they
// keep the bytes and separators of the path. Entries have the last-write time and attributes of
// what they hold; what marks a folder's entry is its attribute word, not a separator at its end.
//
// An operation gives true when it worked, and without an open archive false. A file that cannot be
// opened for exclusive reading, or is the archive itself, adds nothing; one that ends early or
// cannot be read on is stored as far as it got. A link, pipe or device is no file.
class CZipper {
 public:
  explicit CZipper(const char* archivePath = nullptr, const char* rootFolder = nullptr,
                   bool append = false);
  virtual ~CZipper();
  CZipper(const CZipper&) = delete;
  CZipper& operator=(const CZipper&) = delete;

  // Closes what was open and opens the archive, replacing an older file of that name. With append,
  // an archive of that name is added to. Without a root folder it is the archive's own.
  bool Open(const char* archivePath, const char* rootFolder = nullptr, bool append = false);

  // True also when nothing was open. Counters stay until the next Open.
  bool Close();

  // A rooted path must begin with RootFolder, and a relative one must not begin by going up, unless
  // the path is ignored. The entry is never marked read-only.
  bool AddFile(const std::string& path, bool ignorePath = false);

  // The folder's entry, which RootFolder itself does not get, and then all that it holds, in the
  // order of ListFolder and whatever fails with it. Names that begin with a "." are left out.
  bool AddFolder(const std::string& path, bool ignorePath = false);

  // The file under its own name in a folder of the archive, which must not be rooted.
  bool AddFileWithFolder(const std::string& path, const std::string& folder);

  // Memory as an entry of that name, which must not be rooted; dated now, in UTC.
  bool AddBuffer(const void* data, uint32_t size, const std::string& name);

  void GetFileInfo(ZipFileInfo& info) const;

  // Packs a folder, or a file, into an archive beside it: "data" into "data.zip", "a.txt" into
  // "a.zip". False if the archive cannot be opened or what is to be packed is refused.
  static bool ZipFolder(const std::string& folder, bool ignorePath);
  static bool ZipFile(const std::string& path);

  zipFile ZipHandle = nullptr;  // of the open archive, else null
  std::string RootFolder;       // without a separator at its end; empty without an open archive
  ZipFileInfo Counters;

 private:
  std::string SourcePath(const std::string& path) const;
  std::optional<std::string> FileEntryName(const std::string& path, bool ignorePath) const;

  // 0, or minizip's code for the failure.
  int OpenEntry(const std::string& name, uint32_t attributes, const CalendarTime& time);
  int WriteToEntry(std::string_view bytes);

  void AddContents(const std::string& folder, bool ignorePath);
  bool PackFile(const std::string& source, const std::string& name, uint32_t attributes);

  std::string ArchivePath;  // absolute
};
