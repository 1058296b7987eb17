#include "platform/windows/file_entry.h"

#include <gtest/gtest.h>

namespace {

TEST(FileEntry, IsALinkByItsTag) {
  const std::tuple<DWORD, DWORD, bool> cases[] = {
      {FILE_ATTRIBUTE_DIRECTORY, 0, false},
      {FILE_ATTRIBUTE_NORMAL, IO_REPARSE_TAG_SYMLINK, false},  // the field has no meaning here
      {FILE_ATTRIBUTE_REPARSE_POINT, IO_REPARSE_TAG_SYMLINK, true},
      {FILE_ATTRIBUTE_REPARSE_POINT | FILE_ATTRIBUTE_DIRECTORY, IO_REPARSE_TAG_MOUNT_POINT, true},
      {FILE_ATTRIBUTE_REPARSE_POINT | FILE_ATTRIBUTE_DIRECTORY, 0, true},  // Wine returns no tag
      {FILE_ATTRIBUTE_REPARSE_POINT, 0xA000001D, true},   // a link of the Linux subsystem
      {FILE_ATTRIBUTE_REPARSE_POINT, 0x9000001A, false},  // a file kept in the cloud
      {FILE_ATTRIBUTE_REPARSE_POINT, 0x80000013, false},  // a deduplicated file
  };
  for (const auto& [attributes, tag, isLink] : cases) {
    WIN32_FIND_DATAA entry = {};
    entry.dwFileAttributes = attributes;
    entry.dwReserved0 = tag;
    EXPECT_EQ(IsLink(entry), isLink) << std::hex << attributes << ' ' << tag;
  }
}

}  // namespace
