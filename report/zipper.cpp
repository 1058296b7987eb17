#include "report/zipper.h"

#include <algorithm>
#include <ctime>

#include "platform/exclusive_file.h"
#include "platform/files.h"
#include "platform/path.h"
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
  const std::optional<std::string> path = AbsolutePath(archivePath == nullptr ? "" : archivePath);
  if (!path) {
    return false;
  }
  const bool adds = append && KindOf(*path) != FileKind::kNone;
  ZipHandle = zipOpen(path->c_str(), adds ? APPEND_STATUS_ADDINZIP : APPEND_STATUS_CREATE);
  if (ZipHandle == nullptr) {
    return false;
  }
  ArchivePath = *path;
  RootFolder = TrimTail(rootFolder == nullptr ? FolderPart(*path) : JoinPath(rootFolder, ""));
  return true;
}

bool CZipper::Close() {
  const bool closed = ZipHandle == nullptr || zipClose(ZipHandle, nullptr) == ZIP_OK;
  ZipHandle = nullptr;
  RootFolder.clear();
  return closed;
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
  if (ZipHandle == nullptr || IsRootedPath(name)) {
    return false;
  }
  constexpr uint32_t normalAttributes = 128;
  int error = OpenEntry(TrimEntryName(name), normalAttributes, UTCNow());
  if (error == ZIP_OK) {
    ++Counters.FileCount;
  }
  const std::string_view bytes(static_cast<const char*>(data), size);
  for (size_t place = 0; error == ZIP_OK && place < size; place += chunkSize) {
    error = WriteToEntry(bytes.substr(place, chunkSize));
  }
  zipCloseFileInZip(ZipHandle);
  return error == ZIP_OK;
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
  if (const std::string entryName = TrimEntryName(*name); !entryName.empty()) {
    OpenEntry(entryName, AttributeWord(folder), TimeOf(folder));
    zipCloseFileInZip(ZipHandle);
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
  // Absolute, as a relative path would lie below the root folder, which is the folder itself.
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
  // Opened, the archive of an archive would have replaced it before it is packed.
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

int CZipper::OpenEntry(const std::string& name, uint32_t attributes, const CalendarTime& time) {
  // Signed in some versions of minizip, unsigned in others.
  using Field = decltype(tm_zip::tm_sec);
  zip_fileinfo info = {};
  info.tmz_date.tm_sec = static_cast<Field>(time.Second);
  info.tmz_date.tm_min = static_cast<Field>(time.Minute);
  info.tmz_date.tm_hour = static_cast<Field>(time.Hour);
  info.tmz_date.tm_mday = static_cast<Field>(time.Day);
  info.tmz_date.tm_mon = static_cast<Field>(std::max(time.Month - 1, 0));  // 0 without a time
  info.tmz_date.tm_year = static_cast<Field>(time.Year);
  info.external_fa = attributes;
  return zipOpenNewFileInZip(ZipHandle, name.c_str(), &info, nullptr, 0, nullptr, 0, nullptr,
                             Z_DEFLATED, Z_DEFAULT_COMPRESSION);
}

int CZipper::WriteToEntry(std::string_view bytes) {
  const int error =
      zipWriteInFileInZip(ZipHandle, bytes.data(), static_cast<unsigned>(bytes.size()));
  if (error == ZIP_OK) {
    Counters.UncompressedSize += static_cast<uint32_t>(bytes.size());
  }
  return error;
}

bool CZipper::PackFile(const std::string& source, const std::string& name, uint32_t attributes) {
  // Where nothing keeps an open file from being opened again, the archive would swallow itself.
  if (IsSameFile(source, ArchivePath)) {
    return false;
  }
  ExclusiveFile file(source);
  if (!file.IsOpen()) {
    return false;
  }
  int error = OpenEntry(TrimEntryName(name), attributes, TimeOf(source));
  if (error == ZIP_OK) {
    ++Counters.FileCount;
  }
  char buffer[chunkSize];
  while (error == ZIP_OK) {
    const size_t size = file.Read(buffer, sizeof buffer);
    if (size == 0) {
      break;
    }
    error = WriteToEntry({buffer, size});
  }
  zipCloseFileInZip(ZipHandle);
  return error == ZIP_OK;
}
