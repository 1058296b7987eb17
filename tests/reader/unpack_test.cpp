#include "reader/unpack.h"

#include <gtest/gtest.h>

#include "tests/reader/archive_builder.h"
#include "tests/support/scratch_folder.h"

namespace {

TEST(Unpack, RestoresAllButWhatIsRefused) {
  const ScratchFolder scratch;
  scratch.Make("out/there", "old");
  const std::string archive =
      scratch.Make("a.zip", BuildArchive({{"A", "", 0x10},
                                          {"A/r", "x", 0, 0, 8},
                                          {"../up", "x"},
                                          {"A/link", "/etc/passwd", 0xA1FFU << 16},
                                          {"there", "new"},
                                          {"A/r/below", "x"},
                                          {"short", "x", 0, 0, 0, 1}}));
  size_t entries = 0;
  const UnpackResult result = UnpackArchive(archive, scratch.In("out"), [&entries] { ++entries; });
  EXPECT_TRUE(result.IsDone && result.Restored == 1 && entries == 7);
  const std::vector<std::string> leftOut = {
      "../up leads out of the folder or is no name here.", "A/link is a link.",
      "there is there already.", "A/r/below cannot be made: a folder above it is a link or a file.",
      "short is damaged."};
  EXPECT_EQ(result.LeftOut, leftOut);
  EXPECT_EQ(scratch.Tree(), "a.zip\nout/\nout/A/\nout/A/r\nout/there\n");
  EXPECT_EQ(FileText(scratch.In("out/A/r")) + FileText(scratch.In("out/there")), "xold");
}

}  // namespace
