#pragma once

#include <cstdint>
#include <functional>
#include <string_view>

#include "platform/posix/registry/export_text.h"

enum class HeadingKind {
  kKey,      // [HKEY_LOCAL_MACHINE\SOFTWARE]
  kRemoval,  // [-HKEY_LOCAL_MACHINE\SOFTWARE]: this key and all below it
  kOther,    // of another root, or without a closing bracket
};

struct RegistryHeading {
  HeadingKind Kind = HeadingKind::kOther;
  std::string_view Path;  // below HKEY_LOCAL_MACHINE, in UTF-8, as written; empty for kOther
  uint32_t Begin = 0;     // offset in the export
};

// Reads an export once, calls the visitor for each heading in its order and returns the offset of
// its end. A heading is valid until the visitor returns. Lines of 512 KiB or more, which is longer
// than any path may be, are skipped.
uint32_t VisitHeadings(const ByteReader& read, const ExportFormat& format,
                       const std::function<void(const RegistryHeading&)>& visitor);
