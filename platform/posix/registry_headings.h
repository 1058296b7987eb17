#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "platform/posix/registry_lines.h"
#include "platform/posix/registry_pieces.h"
#include "platform/posix/registry_text.h"

enum class HeadingKind : char {
  kKey = '+',      // [HKEY_LOCAL_MACHINE\SOFTWARE\ZEK]
  kRemoval = '-',  // [-HKEY_LOCAL_MACHINE\SOFTWARE\ZEK]: this key and all below it
  kOther = '?',    // a key that lies elsewhere, or a heading that breaks off
};

struct RegistryHeading {
  HeadingKind Kind = HeadingKind::kOther;
  std::string_view Path;  // below HKEY_LOCAL_MACHINE, as written; lives as long as the list
  uint64_t Begin = 0;     // of the heading in the file, in bytes
  uint64_t End = 0;       // of the lines below it
};

// Every heading of an export, in file order. The export goes by once, and nothing of it is kept but
// where the headings stand and what paths they name.
class RegistryHeadings {
 public:
  explicit RegistryHeadings(const ByteReader& read);

  size_t Count() const { return Places.size(); }
  RegistryHeading At(size_t index) const;

  ExportEncoding Encoding() const { return FileEncoding; }
  HexText HexForm() const { return FileHexForm; }

 private:
  struct Place {
    uint64_t Begin;  // in the file
    size_t Record;   // in Records: one character for the kind, and the path behind it
  };

  void ScanLines(std::string_view bytes, uint64_t offset, size_t from);
  void AddHeading(std::string_view line, uint64_t offset);
  void AddRecord(HeadingKind kind, std::string_view path, uint64_t offset);

  ExportEncoding FileEncoding = ExportEncoding::kUtf8;
  HexText FileHexForm = HexText::kUtf16;
  uint64_t FileEnd = 0;
  std::vector<Place> Places;
  std::string Records;
  std::string DecodedLine;  // one buffer for all of them
};
