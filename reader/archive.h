#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

// The bytes of an archive, read where they are needed.
struct ArchiveBytes {
  uint64_t Size = 0;
  // Fills at most size bytes of the buffer from the offset on and returns how many.
  std::function<size_t(uint64_t offset, char* buffer, size_t size)> ReadAt;
};

struct ArchiveEntry {
  std::string Path;          // raw bytes, parts joined by '/', no '/' at the end
  uint64_t Size = 0;         // in bytes, unpacked, as the archive says
  uint64_t DirectoryOffset;  // of its record
  bool IsFolder = false;     // by its attribute, or by a separator at the end of its name
  bool IsLink = false;
  bool IsEncrypted = false;
  unsigned Method = 0;  // of compression
};

// A zip archive, of the recorder on any system or of another tool. Nothing in it is trusted.
class Archive {
 public:
  // Reads the directory. Nothing, and one line that says what is wrong and what to do, if the bytes
  // are no archive or the directory is lost.
  static std::unique_ptr<Archive> Open(const ArchiveBytes& bytes, std::string& error);

  ~Archive();
  Archive(const Archive&) = delete;
  Archive& operator=(const Archive&) = delete;

  // In the order of the directory, at most kMostFiles with kMostBytesOfNames (reader/limits.h).
  const std::vector<ArchiveEntry>& Entries() const { return AllEntries; }

  // What was left out of the entries and why, a sentence each.
  const std::vector<std::string>& Complaints() const { return AllComplaints; }

  // Unpacks an entry piece by piece into the sink, which returns false to stop. False, and the
  // reason as the end of a sentence that begins with the entry's name, if it cannot be unpacked
  // whole; the bytes that the sink got by then may be damaged.
  bool Unpack(const ArchiveEntry& entry, const std::function<bool(std::string_view)>& sink,
              std::string& reason);

 private:
  class Stream;
  Archive();
  void ReadDirectory();
  bool ReadRecord(size_t& bytesOfNames);

  std::unique_ptr<Stream> Bytes;
  void* Handle = nullptr;
  std::vector<ArchiveEntry> AllEntries;
  std::vector<std::string> AllComplaints;
  size_t LongNames = 0;
  std::vector<char> Piece = std::vector<char>(1 << 16);  // of an entry that is unpacked
};
