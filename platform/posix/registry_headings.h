#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

#include "platform/posix/registry_lines.h"
#include "platform/posix/registry_pieces.h"
#include "platform/posix/registry_text.h"

// How an export is written, as its first bytes say.
struct ExportFormat {
  uint64_t Begin = 0;  // behind the mark
  ExportEncoding Encoding = ExportEncoding::kUtf8;
  HexText HexForm = HexText::kUtf16;
};

ExportFormat ReadFormat(const ByteReader& read);

enum class HeadingKind {
  kKey,      // [HKEY_LOCAL_MACHINE\SOFTWARE\ZEK]
  kRemoval,  // [-HKEY_LOCAL_MACHINE\SOFTWARE\ZEK]: this key and all below it
  kOther,    // a key that lies elsewhere, or a heading that breaks off
};

struct RegistryHeading {
  HeadingKind Kind = HeadingKind::kOther;
  std::string_view Path;  // below HKEY_LOCAL_MACHINE, as written
  uint64_t Begin = 0;     // of the heading in the file, in bytes
};

// Finds the headings in stretches of an export.
class RegistryHeadings {
 public:
  // The path of a heading is good until the visitor returns.
  using Visitor = std::function<void(const RegistryHeading&)>;

  RegistryHeadings(ByteReader read, ExportEncoding encoding);

  // Shows the visitor each heading of a stretch, which begins with a line. Gives the stretch's end,
  // or the file's if that comes first.
  uint64_t Visit(uint64_t begin, uint64_t end, const Visitor& visitor);

 private:
  void VisitPiece(const Visitor& visitor);
  void VisitLine(std::string_view line, uint64_t offset, const Visitor& visitor);

  ExportEncoding Encoding;
  RegistryPieces Pieces;
  std::string LineBuffer;  // one buffer for all of them
};
