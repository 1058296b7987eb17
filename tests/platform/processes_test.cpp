#include "platform/processes.h"

#include <algorithm>

#include "tests/platform/contract.h"

TEST(Processes, AreListedWithThisOne) {
  const std::vector<uint32_t> ids = ListProcessIDs().value();
  EXPECT_NE(std::find(ids.begin(), ids.end(), OwnProcessID()), ids.end());
  EXPECT_EQ(FirstModuleOf(OwnProcessID()).value().BaseName,
            isWindows ? "orx_platform_tests.exe" : "orx_platform_tests");
  EXPECT_FALSE(FirstModuleOf(4294967292U));
}
