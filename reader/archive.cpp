#include "reader/archive.h"

#include "reader/archive_names.h"
#include "reader/archive_stream.h"
#include "reader/limits.h"

namespace {

constexpr unsigned kStored = 0;

ArchiveEntry EntryOf(const unz_file_info64& info) {
  constexpr uLong folder = 0x10;
  constexpr uLong kindMask = 0xF000;  // of the mode, which Unix tools keep in the upper half
  constexpr uLong link = 0xA000;
  constexpr uLong encrypted = 0x1;
  ArchiveEntry entry = {};
  entry.Size = info.uncompressed_size;
  entry.IsFolder = (info.external_fa & folder) != 0;
  entry.IsLink = ((info.external_fa >> 16) & kindMask) == link;
  entry.IsEncrypted = (info.flag & encrypted) != 0;
  entry.Method = static_cast<unsigned>(info.compression_method);
  return entry;
}

std::string WhyNotOpened(const ArchiveBytes& bytes) {
  char begin[4] = {};
  bytes.ReadAt(0, begin, sizeof begin);
  if (bytes.Size == 0) {
    return "is empty; copy the archive again";
  }
  const std::string_view signature(begin, sizeof begin);
  if (signature == "PK\x05\x06") {
    return "is an empty archive; name one that holds a history";
  }
  return signature == "PK\x03\x04"
             ? "is cut off or damaged: its directory at the end is missing; copy the archive again"
             : "is neither a zip archive nor a folder; name one that holds a history";
}

}  // namespace

Archive::Archive() = default;

Archive::~Archive() {
  if (Handle != nullptr) {
    ::unzClose(Handle);
  }
}

std::unique_ptr<Archive> Archive::Open(const ArchiveBytes& bytes, std::string& error) {
  std::unique_ptr<Archive> archive(new Archive);
  archive->Bytes = std::make_unique<Stream>(bytes);
  zlib_filefunc64_def functions = archive->Bytes->Functions();
  archive->Handle = ::unzOpen2_64("", &functions);
  if (archive->Handle == nullptr) {
    error = WhyNotOpened(bytes);
    return nullptr;
  }
  archive->ReadDirectory();
  return archive;
}

void Archive::ReadDirectory() {
  unz_global_info64 info = {};
  ::unzGetGlobalInfo64(Handle, &info);
  size_t bytesOfNames = 0;
  int result = info.number_entry == 0 ? UNZ_END_OF_LIST_OF_FILE : ::unzGoToFirstFile(Handle);
  while (result == UNZ_OK && ReadRecord(bytesOfNames)) {
    result = ::unzGoToNextFile(Handle);
  }
  if (result == UNZ_OK) {
    AllComplaints.push_back("The archive holds more than " + std::to_string(AllEntries.size()) +
                            " entries; the others are left out.");
  } else if (result != UNZ_END_OF_LIST_OF_FILE) {
    AllComplaints.push_back("The archive's directory is damaged after " +
                            std::to_string(AllEntries.size()) + " of " +
                            std::to_string(info.number_entry) + " entries.");
  }
  if (LongNames > 0) {
    AllComplaints.push_back("Entries left out, as their names have more than " +
                            std::to_string(kMostBytesOfName) +
                            " bytes: " + std::to_string(LongNames) + ".");
  }
  TurnNamesToPaths(AllEntries);
}

// False at a limit.
bool Archive::ReadRecord(size_t& bytesOfNames) {
  unz_file_info64 info = {};
  if (AllEntries.size() >= kMostFiles ||
      ::unzGetCurrentFileInfo64(Handle, &info, /*szFileName=*/nullptr, 0, /*extraField=*/nullptr, 0,
                                /*szComment=*/nullptr, 0) != UNZ_OK) {
    return AllEntries.size() < kMostFiles;
  }
  if (info.size_filename > kMostBytesOfName) {
    ++LongNames;
    return true;
  }
  ArchiveEntry entry = EntryOf(info);
  entry.Path.resize(info.size_filename);
  ::unzGetCurrentFileInfo64(Handle, &info, entry.Path.data(), info.size_filename,
                            /*extraField=*/nullptr, 0, /*szComment=*/nullptr, 0);
  entry.DirectoryOffset = ::unzGetOffset64(Handle);
  bytesOfNames += entry.Path.size();
  AllEntries.push_back(std::move(entry));
  return bytesOfNames <= kMostBytesOfNames;
}

bool Archive::Unpack(const ArchiveEntry& entry, const std::function<bool(std::string_view)>& sink,
                     std::string& reason) {
  if (entry.IsEncrypted) {
    reason = "is encrypted; ask for an archive without a password";
    return false;
  }
  if (entry.Method != kStored && entry.Method != Z_DEFLATED) {
    reason = "is packed with method " + std::to_string(entry.Method) + ", which is not known here";
    return false;
  }
  reason = "is damaged";
  if (::unzSetOffset64(Handle, entry.DirectoryOffset) != UNZ_OK ||
      ::unzOpenCurrentFile(Handle) != UNZ_OK) {
    return false;
  }
  uint64_t total = 0;
  int count = 0;
  bool isWanted = true;
  while (isWanted && (count = ::unzReadCurrentFile(Handle, Piece.data(),
                                                   static_cast<unsigned>(Piece.size()))) > 0) {
    total += static_cast<uint64_t>(count);
    isWanted = sink({Piece.data(), static_cast<size_t>(count)});
  }
  const bool isIntact = ::unzCloseCurrentFile(Handle) == UNZ_OK;
  return isWanted && isIntact && count == 0 && total == entry.Size;
}
