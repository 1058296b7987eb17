#include "products/registry_value.h"

#include <gtest/gtest.h>

#include "tests/fake_machine.h"

namespace {

using namespace std::string_literals;

TEST(RegistryValue, ReadsTextsAndNumbersAndNothingElse) {
  const std::vector<std::pair<RegistryData, std::string>> cases = {
      {{kRegistryText, "plain\0"s}, "plain"},
      {{kRegistryText, "no zero"s}, "no zero"},
      {{kRegistryText, "first\0second\0"s}, "first"},
      {{kRegistryText, std::string(99, 'x') + '\0'}, std::string(99, 'x')},
      {{kRegistryText, std::string(100, 'x') + '\0'}, ""},
      {{kRegistryText, "\0"s}, ""},
      {{kRegistryNumber, "\0\0\0\0"s}, "0"},
      {{kRegistryNumber, "\x09\x04\0\0"s}, "1033"},
      {{kRegistryNumber, "\xFF\xFF\xFF\xFF"s}, "-1"},
      {{kRegistryNumber, "\0\0\0\x80"s}, "-2147483648"},
      {{kRegistryNumber, "\x01\x02"s}, ""},
      {{2, "%PATH%\0"s}, ""},
      {{3, "\x01\x02\x03\x04"s}, ""},
      {{0, ""}, ""},
  };
  for (const auto& [data, text] : cases) {
    Machine() = FakeMachine();
    Machine().SetData("SOFTWARE\\ZEK", "Value", data);
    EXPECT_EQ(ReadRegistryValue("SOFTWARE\\ZEK", "Value"), text);
  }
  EXPECT_EQ(ReadRegistryValue("SOFTWARE\\ZEK", "Missing"), "");
  EXPECT_EQ(ReadRegistryValue("SOFTWARE\\None", "Value"), "");
}

}  // namespace
