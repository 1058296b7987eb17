// Files that another program, such as a scanner, keeps open for a moment.

#include "eventlog/logger.h"
#include "platform/exclusive_file.h"
#include "platform/files.h"
#include "tests/platform/contract.h"
#include "tests/windows/holder.h"

namespace {

using namespace std::chrono_literals;

class HeldFile : public Platform {
 protected:
  std::function<UniqueHandle()> Opens(DWORD share) const {
    return [this, share] { return OpenExisting(File, GENERIC_READ, share); };
  }

  const std::string File = Make("folder/file", "text");
};

TEST_F(HeldFile, IsWaitedForBeforeItIsPacked) {
  {
    const Holder holder(Opens(FILE_SHARE_READ), 100ms);
    EXPECT_TRUE(ExclusiveFile(File).IsOpen());
  }
  const Holder holder(Opens(FILE_SHARE_READ), 10s);
  EXPECT_FALSE(ExclusiveFile(File).IsOpen());
}

TEST_F(HeldFile, IsWaitedForBeforeItIsCopied) {
  const Holder holder(Opens(/*share=*/0), 100ms);
  EXPECT_TRUE(CopyToNewFile(File, In("copy"), /*trusted=*/Root));
}

TEST_F(HeldFile, IsWaitedForBeforeALogIsWritten) {
  const Holder holder(Opens(FILE_SHARE_READ), 100ms);
  CLogger& log = CLogger::GetInstance();
  log.Open(File, std::ios::app);
  log << ", more" << std::flush;
  log.Close();
  EXPECT_EQ(FileText(File), "text, more");
}

}  // namespace
