#include "products/odbc_drivers.h"

#include <gtest/gtest.h>

#include "tests/fake_machine.h"

namespace {

TEST(ODBCDrivers, AreThoseWithTheFamilysName) {
  Machine() = FakeMachine();
  const std::string catalogue = "SOFTWARE\\ODBC\\ODBCINST.INI\\";
  for (const char* name :
       {"ZEK ORX", "Old ZEK ORX Driver (x86)", "zek orx", "ZEK  ORX", "ZEK OR"}) {
    Machine().SetText(catalogue + "ODBC Drivers", name, "Installed");
  }
  Machine().SetNumber(catalogue + "ODBC Drivers", "ZEK ORX by number", 1);
  Machine().SetNumber(catalogue + "ZEK ORX", "UsageCount", 0xFFFFFFFF);
  Machine().SetData(catalogue + "ZEK ORX", "Setup", {2, std::string("%X%\0", 4)});
  CODBCDriversList list;
  list.Collect();
  ASSERT_EQ(list.Drivers.size(), 3U);
  EXPECT_EQ(list.Drivers[0].Name, "ZEK ORX");
  EXPECT_EQ(list.Drivers[1].Name, "Old ZEK ORX Driver (x86)");
  EXPECT_EQ(list.Drivers[2].Name, "ZEK ORX by number");
  EXPECT_TRUE(list.Drivers[1].Parameters.empty());
  ASSERT_EQ(list.Drivers[0].Parameters.size(), 2U);
  EXPECT_EQ(list.Drivers[0].Parameters[0].Value, "-1");
  EXPECT_EQ(list.Drivers[0].Parameters[1].Name, "Setup");
  EXPECT_EQ(list.Drivers[0].Parameters[1].Value, "");
}

}  // namespace
