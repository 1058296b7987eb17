#include "report/zipper.h"

#include <algorithm>
#include <ctime>

#include "platform/ascii_case.h"
#include "platform/files.h"
#include "platform/path.h"
#include "platform/profile_file.h"
#include "report/zip_names.h"

static constexpr size_t chunkSize = 2048;

static uint32_t AttributeWord(const std::string& path) {
  constexpr uint32_t invalidAttributes = 0xFFFFFFFF;
  return FileAttributes(path).value_or(invalidAttributes);
}

static CalendarTime TimeOf(const std::string& path) {
  return LastWriteTime(path).value_or(CalendarTime());
}

static CalendarTime UTCNow() {
  const std::time_t now = std::time(nullptr);
  const std::tm* utc = std::gmtime(&now);
  return {utc->tm_year + 1900, utc->tm_mon + 1, utc->tm_mday,
          utc->tm_hour,        utc->tm_min,     utc->tm_sec};
}

// The time itself, or the first or last one that an archive can store.
static CalendarTime Storable(const CalendarTime& time) {
  constexpr CalendarTime first = {1980, 1, 1, 0, 0, 0};
  constexpr CalendarTime last = {2107, 12, 31, 23, 59, 59};
  const bool isNone = time.Year == 0;
  return isNone || (time.Year >= first.Year && time.Year <= last.Year) ? time
         : time.Year < first.Year                                      ? first
                                                                       : last;
}

static bool BeginsWithPart(const std::string& path, const char* part) {
  return path.starts_with(std::string(part) + kPathSeparator);
}

static std::string TrimEntryName(const std::string& name) { return TrimHead(TrimTail(name)); }

CZipper::CZipper(const char* archivePath, const char* rootFolder, bool append) {
  Open(archivePath, rootFolder, append);
}

CZipper::~CZipper() { Close(); }

bool CZipper::Open(const char* archivePath, const char* rootFolder, bool append) {
  Close();
  Counters = {};
  EntryCount = 0;
  WithinLimits = true;
  const std::optional<std::string> path = AbsolutePath(archivePath == nullptr ? "" : archivePath);
  if (!path || IsSymbolicLink(*path)) {
    return false;
  }
  const FileKind kind = KindOf(*path);
  if (kind != FileKind::kNone && kind != FileKind::kFile) {
    return false;
  }
  if (append && kind == FileKind::kFile) {
    ZipHandle = zipOpen(path->c_str(), APPEND_STATUS_ADDINZIP);
  } else if (NewArchive.emplace(*path).Exists()) {
    ZipHandle = zipOpen(NewArchive->Path().c_str(), APPEND_STATUS_CREATE);
  }
  if (ZipHandle == nullptr) {
    NewArchive.reset();
    return false;
  }
  IsWritten = true;
  ArchivePath = *path;
  RootFolder = TrimTail(rootFolder == nullptr ? FolderPart(*path) : JoinPath(rootFolder, ""));
  return true;
}

bool CZipper::Close() {
  RootFolder.clear();
  if (ZipHandle == nullptr) {
    return true;
  }
  IsWritten = zipClose(ZipHandle, nullptr) == ZIP_OK && IsWritten;
  ZipHandle = nullptr;
  const bool isInPlace = IsWritten && (!NewArchive || NewArchive->Replace());
  NewArchive.reset();
  return isInPlace;
}

bool CZipper::AddFile(const std::string& path, bool ignorePath) {
  constexpr uint32_t readOnly = 0x1;
  if (ZipHandle == nullptr || (!ignorePath && BeginsWithPart(path, ".."))) {
    return false;
  }
  const std::optional<std::string> name = FileEntryName(path, ignorePath);
  return name && PackFile(SourcePath(path), *name, AttributeWord(path) & ~readOnly);
}

bool CZipper::AddFileWithFolder(const std::string& path, const std::string& folder) {
  if (ZipHandle == nullptr || IsRootedPath(folder)) {
    return false;
  }
  return PackFile(SourcePath(path), JoinPath(folder, BaseName(path)), AttributeWord(path));
}

bool CZipper::AddBuffer(const void* data, uint32_t size, const std::string& name) {
  constexpr uint32_t normalAttributes = 128;
  if (ZipHandle == nullptr || IsRootedPath(name) ||
      !BeginEntry(TrimEntryName(name), normalAttributes, UTCNow())) {
    return false;
  }
  ++Counters.FileCount;
  const std::string_view bytes(static_cast<const char*>(data), size);
  bool isWritten = true;
  for (size_t offset = 0; isWritten && offset < size; offset += chunkSize) {
    isWritten = WriteToEntry(bytes.substr(offset, chunkSize));
  }
  EndEntry();
  return isWritten;
}

bool CZipper::AddFolder(const std::string& path, bool ignorePath) {
  if (ZipHandle == nullptr) {
    return false;
  }
  ++Counters.FolderCount;
  const std::string folder = SourcePath(path);
  const std::optional<std::string> name =
      ignorePath ? BaseName(TrimTail(folder)) : CutFolder(folder, RootFolder);
  if (!name) {
    return false;
  }
  const std::string entryName = TrimEntryName(*name);
  if (!entryName.empty() && BeginEntry(entryName, AttributeWord(folder), TimeOf(folder))) {
    EndEntry();
  }
  AddContents(folder, ignorePath);
  return true;
}

void CZipper::AddContents(const std::string& folder, bool ignorePath) {
  for (const FolderEntry& entry : ListFolder(folder)) {
    if (entry.Name.starts_with('.')) {
      continue;
    }
    const std::string path = JoinPath(folder, entry.Name);
    if ((entry.Attributes & kFolderAttribute) != 0) {
      AddFolder(path, ignorePath);
    } else {
      AddFile(path, ignorePath);
    }
  }
}

void CZipper::GetFileInfo(ZipFileInfo& info) const { info = Counters; }

bool CZipper::ZipFolder(const std::string& folder, bool ignorePath) {
  // Absolute, as a relative path would be below the root folder, which is the folder itself.
  const std::optional<std::string> path = AbsolutePath(folder);
  if (!path) {
    return false;
  }
  const std::string root = TrimTail(*path);
  CZipper zipper;
  return zipper.Open((root + ".zip").c_str(), root.c_str()) && zipper.AddFolder(root, ignorePath);
}

bool CZipper::ZipFile(const std::string& path) {
  const std::optional<std::string> file = AbsolutePath(path);
  if (!file) {
    return false;
  }
  const std::string archive = ReplaceExtension(*file, ".zip");
  CZipper zipper;
  // An archive cannot contain the file that it replaces.
  return !IsSameFile(*file, archive) && zipper.Open(archive.c_str(), FolderPart(*file).c_str()) &&
         zipper.AddFile(*file);
}

std::string CZipper::SourcePath(const std::string& path) const {
  return IsRootedPath(path) ? path : JoinPath(RootFolder, path);
}

std::optional<std::string> CZipper::FileEntryName(const std::string& path, bool ignorePath) const {
  if (ignorePath) {
    return BaseName(path);
  }
  if (IsRootedPath(path)) {
    return CutFolder(path, RootFolder);
  }
  return BeginsWithPart(path, ".") ? path.substr(2) : path;
}

bool CZipper::BeginEntry(const std::string& name, uint32_t attributes, const CalendarTime& time) {
  if (EntryCount == Limits.Entries) {
    WithinLimits = false;
    return false;
  }
  // Signed in some versions of minizip, unsigned in others.
  using Field = decltype(tm_zip::tm_sec);
  const CalendarTime stored = Storable(time);
  zip_fileinfo info = {};
  info.tmz_date.tm_sec = static_cast<Field>(stored.Second);
  info.tmz_date.tm_min = static_cast<Field>(stored.Minute);
  info.tmz_date.tm_hour = static_cast<Field>(stored.Hour);
  info.tmz_date.tm_mday = static_cast<Field>(stored.Day);
  info.tmz_date.tm_mon = static_cast<Field>(std::max(stored.Month - 1, 0));  // 0 without a time
  info.tmz_date.tm_year = static_cast<Field>(stored.Year);
  info.external_fa = attributes;
  if (zipOpenNewFileInZip(ZipHandle, name.c_str(), &info, nullptr, 0, nullptr, 0, nullptr,
                          Z_DEFLATED, Z_DEFAULT_COMPRESSION) != ZIP_OK) {
    EndEntry();  // part of it may be written
    IsWritten = false;
    return false;
  }
  ++EntryCount;
  return true;
}

bool CZipper::WriteToEntry(std::string_view bytes) {
  if (zipWriteInFileInZip(ZipHandle, bytes.data(), static_cast<unsigned>(bytes.size())) != ZIP_OK) {
    IsWritten = false;
    return false;
  }
  Counters.UncompressedSize += static_cast<uint32_t>(bytes.size());
  return true;
}

void CZipper::EndEntry() {
  if (zipCloseFileInZip(ZipHandle) != ZIP_OK) {
    IsWritten = false;
  }
}

bool CZipper::PackFile(const std::string& source, const std::string& name, uint32_t attributes) {
  if (IsSameFile(source, ArchivePath)) {
    return false;
  }
  std::optional<ProfileGuard> guard;
  if (!GuardedFile.empty() && EqualsIgnoringCase(source, GuardedFile)) {
    guard.emplace(GuardedFile);
  }
  ExclusiveFile file(source);
  if (!file.IsOpen() || !BeginEntry(TrimEntryName(name), attributes, TimeOf(source))) {
    return false;
  }
  ++Counters.FileCount;
  const bool isWritten = CopyToEntry(file);
  EndEntry();
  return isWritten;
}

// False if a write fails; a failed read ends the entry.
bool CZipper::CopyToEntry(ExclusiveFile& file) {
  WithinLimits = WithinLimits && file.Size() <= Limits.EntrySize;
  char buffer[chunkSize];
  for (uint64_t rest = Limits.EntrySize; rest > 0;) {
    const size_t size = file.Read(buffer, std::min<uint64_t>(rest, sizeof buffer));
    if (size == 0) {
      break;
    }
    if (!WriteToEntry({buffer, size})) {
      return false;
    }
    rest -= size;
  }
  return true;
}
