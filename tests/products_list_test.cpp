#include "products/products_list.h"

#include <gtest/gtest.h>

#include "products/copy_generation.h"
#include "tests/fake_machine.h"

namespace {

std::string NamesOf(const CORXProductsList& list) {
  std::string names;
  for (const CORXCopy& copy : list.Copies) {
    names += copy.Name + ';';
  }
  return names;
}

TEST(ProductsList, TellsCopiesAndProductsByTheirKeys) {
  struct {
    const char* Name;
    bool IsOldCopy;
    bool IsProduct;
  } const cases[] = {
      {"ORX", true, false},     {"orx", false, false},       {"ORX ", false, true},
      {"ORX9", false, false},   {"ORX Server", false, true}, {"orx Server", false, false},
      {"OR", false, false},     {"", false, false},          {"GLOBAL_PROFILE", false, false},
      {"My ORX ", false, false}};
  for (const auto& test : cases) {
    SetCopyGeneration(0);
    EXPECT_EQ(IsCopyKey(test.Name), test.IsOldCopy) << test.Name;
    EXPECT_EQ(IsProductKey(test.Name), test.IsProduct) << test.Name;
    SetCopyGeneration(1);
    EXPECT_TRUE(IsCopyKey(test.Name));
    EXPECT_EQ(IsProductKey(test.Name), test.IsProduct) << test.Name;
  }
}

TEST(ProductsList, FindsTheCopiesOfTheLayoutInForce) {
  Machine() = FakeMachine();
  Machine().SetKey("SOFTWARE\\ZEK\\Other");
  Machine().SetKey("SOFTWARE\\ZEK\\ORX\\InstalledCopies\\zeta");
  Machine().SetKey("SOFTWARE\\ZEK\\ORX\\InstalledCopies\\ORX");
  CORXProductsList list;
  SetCopyGeneration(0);
  list.Collect();
  EXPECT_EQ(NamesOf(list), "ORX;");  // the parent of the later layout's copies
  EXPECT_EQ(list.Copies[0].Generation, 0);
  EXPECT_TRUE(list.Copies[0].Products.empty());

  list.Clear();
  SetCopyGeneration(1);
  list.Collect();
  EXPECT_EQ(list.Collect(), 0);
  EXPECT_EQ(NamesOf(list), "zeta;ORX;zeta;ORX;");
  EXPECT_EQ(list.Copies[3].Generation, 1);
}

TEST(ProductsList, FillsWhatTheReportDoesNotShow) {
  Machine() = FakeMachine();
  const std::string copyKey = "SOFTWARE\\ZEK\\ORX\\InstalledCopies\\C1";
  Machine().SetNumber(copyKey + "\\CurrentVersion", "Version", 9);
  Machine().SetText(copyKey + "\\CurrentVersion", "Release", "4");
  Machine().SetText(copyKey + "\\CurrentVersion", "Modification", "0");
  Machine().SetText(copyKey + "\\CurrentVersion", "Service Level", "Level 0");
  Machine().SetKey(copyKey + "\\ORX Client");
  Machine().SetText(copyKey + "\\ORX Server\\CurrentVersion", "Title", "Server");
  Machine().SetText(copyKey + "\\ORX Server\\CurrentVersion", "Description", "The server");
  Machine().SetData(copyKey + "\\ADM_PROFILES\\ADM1", "Blob", {3, "\x01\x02"});
  Machine().SetKey(copyKey + "\\PROFILES\\I1");
  SetCopyGeneration(1);
  CORXProductsList list;
  list.Collect();
  ASSERT_EQ(NamesOf(list), "C1;");
  const CORXCopy& copy = list.Copies[0];
  EXPECT_EQ(copy.VersionInfo.Version + copy.VersionInfo.Release + copy.VersionInfo.Modification +
                copy.VersionInfo.ServiceLevel,
            "940Level 0");
  ASSERT_EQ(copy.Products.size(), 2U);
  EXPECT_EQ(copy.Products[0].Name, "ORX Client");
  EXPECT_EQ(copy.Products[0].Title, "");
  EXPECT_EQ(copy.Products[1].CopyName, "C1");
  EXPECT_EQ(copy.Products[1].Title, "Server");
  EXPECT_EQ(copy.Products[1].Description, "The server");
  ASSERT_EQ(copy.AdmInstances.size(), 1U);
  EXPECT_EQ(copy.AdmInstances[0].CopyName + copy.AdmInstances[0].Name, "C1ADM1");
  ASSERT_EQ(copy.AdmInstances[0].Parameters.size(), 1U);
  EXPECT_EQ(copy.AdmInstances[0].Parameters[0].Name, "Blob");
  EXPECT_EQ(copy.AdmInstances[0].Parameters[0].Value, "");
  ASSERT_EQ(copy.Instances.size(), 1U);
  EXPECT_EQ(copy.Instances[0].CopyName + copy.Instances[0].Name, "C1I1");
  EXPECT_TRUE(copy.Instances[0].Parameters.empty());
}

}  // namespace
