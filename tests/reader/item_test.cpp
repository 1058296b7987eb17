// Every table of a report, written by the recorder's Print and read back.

#include <gtest/gtest.h>

#include <algorithm>
#include <ios>
#include <utility>

#include "eventlog/logger.h"
#include "inventory/process_list.h"
#include "inventory/service_list.h"
#include "inventory/software_list.h"
#include "inventory/user_list.h"
#include "products/copy_generation.h"
#include "products/odbc_drivers.h"
#include "products/products_list.h"
#include "reader/snapshot.h"
#include "tests/support/file_text.h"
#include "tests/support/run_tool.h"

namespace {

// "section path/path name field=value ...", the parts separated by '|'.
std::string ItemText(const Item& item) {
  std::string text(SectionName(item.Where));
  for (size_t i = 0; i < item.PathSize; ++i) {
    text += (i == 0 ? '|' : '/') + std::string(item.Path[i]);
  }
  text += '|' + std::string(item.Name);
  for (size_t i = 0; i < item.FieldCount; ++i) {
    text += '|' + std::string(FieldNames(item.Where)[i]) + '=';
    text += item.Where == Section::kProcesses ? std::to_string(item.Count)
                                              : std::string(item.Values[i]);
  }
  return text;
}

// A list of every kind, with a row for each column that is tested.
struct Lists {
  Lists() {
    Users.LoggedOnUser = "H\\u";
    Users.LocalGroups = {"Guests"};
    Users.LocalMembers = {{"H\\m", "Guests"}};
    Software.Products = {{"Server", "9.4", "20261101", "C:\\Dir", "ZEK", 1033}};
    Services.Services = {{"s", "ORX", "The service pause is pending"}};
    Copies.Copies = {CORXCopy("C1")};
    Copy().GlobalProfile = {{"LogSize", "4096"}, {"Home", "C:\\ZEK"}};
    Copy().Products = {CORXProduct("C1", "ORX Server")};
    Product().ProductCode = "{1}";
    Product().VersionInfo = {"9", "4", "0", "SL"};
    Product().LastModifiedDate = "20261114";
    Copy().Instances = {CORXInstance("C1", "I1")};
    Copy().Instances[0].Parameters = {{"Port", "5"}};
    Drivers.Drivers = {CODBCDriver("ZEK ORX")};
    Drivers.Drivers[0].Parameters = {{"Setup", "5"}};
  }

  CORXCopy& Copy() { return Copies.Copies[0]; }
  CORXProduct& Product() { return Copy().Products[0]; }

  // Writes a part of the report, its first rows padded on that side.
  void Print(size_t part, Padding padding) {
    CLogger::GetInstance() << (padding == Padding::kRight ? std::left : std::right);
    if (part == 0) {
      Users.LocalMembers[0].Group = Users.LocalGroups[0];
      Users.Print();
    } else if (part == 1) {
      Software.Print();
    } else if (part == 3) {
      Services.Print();
    } else if (part == 4) {  // the copies of both generations, of which the first has none
      SetCopyGeneration(0);
      CORXProductsList().Print();
      SetCopyGeneration(1);
      Copies.Print();
    } else {
      Drivers.Print();
    }
  }

  CUsersList Users;
  CProductsList Software;
  CServicesList Services;
  CORXProductsList Copies;
  CODBCDriversList Drivers;
};

Lists lists;

// A column, printed with values of about its width.
struct Column {
  const char* Name;
  size_t Part;
  size_t Width;
  std::string& Value;  // in the lists
  const char* Item;    // as it reads back with the value that the lists begin with
  // How rows read back with one byte less than the width, exactly it and one more: 'f' with fields,
  // 'r' as the entire row. A fourth letter is for overlong values with a blank, which shift the
  // columns after it.
  const char* Kinds;
  std::string Beginning = {};  // of every value: others are not printed
};

CProductInfo& software = lists.Software.Products[0];
CORXProduct& product = lists.Product();
const char* const softwareItem =
    "software|ZEK|Server|version=9.4|date=20261101|language=1033|location=C:\\Dir";
const char* const productItem =
    "products|C1|ORX Server|code={1}|version=9.4.0|service_level=SL|modified=20261114";

const Column columns[] = {
    {"group", 0, 30, lists.Users.LocalGroups[0], "members|Guests|H\\m", "fff"},
    {"publisher", 1, 30, software.Publisher, softwareItem, "frrr", "ZEK"},
    {"software", 1, 65, software.DisplayName, softwareItem, "frrr"},
    {"software version", 1, 20, software.DisplayVersion, softwareItem, "frrr"},
    {"date", 1, 14, software.InstallDate, softwareItem, "frrr"},
    {"location", 1, 99, software.InstallLocation, softwareItem, "fff"},
    {"service", 3, 60, lists.Services.Services[0].DisplayName,
     "services|ORX|state=The service pause is pending", "fff", "ORX"},
    {"profile", 4, 29, lists.Copy().GlobalProfile[0].Name, "profile|C1|LogSize|value=4096", "fff"},
    {"profile, a colon in the value", 4, 29, lists.Copy().GlobalProfile[1].Name,
     "profile|C1|Home|value=C:\\ZEK", "frr"},
    {"product", 4, 40, product.Name, productItem, "ffrr"},
    {"code", 4, 40, product.ProductCode, productItem, "ffrr"},
    {"version", 4, 6, product.VersionInfo.Version, productItem, "ffrr"},
    {"service level", 4, 20, product.VersionInfo.ServiceLevel, productItem, "ffrr"},
    {"modified", 4, 20, product.LastModifiedDate, productItem, "fff"},
    {"parameter of an instance", 4, 36, lists.Copy().Instances[0].Parameters[0].Name,
     "instance_profile|C1/I1|Port|value=5", "frr"},
    {"parameter of a driver", 5, 30, lists.Drivers.Drivers[0].Parameters[0].Name,
     "driver_parameters|ZEK ORX|Setup|value=5", "frr"},
};

void Check(const Column& column, std::string value, char kind, Padding padding) {
  value.replace(0, column.Beginning.size(), column.Beginning);
  const std::string old = std::exchange(column.Value, value);
  const std::string text = LoggedText([&] { lists.Print(column.Part, padding); });
  column.Value = old;
  const auto items = ReadItems(text, column.Part, padding);
  ASSERT_TRUE(items) << column.Name << '\n' << text;
  const std::string expected = Replaced(column.Item, old, value);
  const auto isExpected = [&](const Item& item) {
    const std::string name(item.Name);
    const bool isRow = item.FieldCount == 0 && name.find(value) != name.npos &&
                       text.find('\n' + name + '\n') != text.npos;
    return kind == 'f' ? ItemText(item) == expected : isRow;
  };
  EXPECT_TRUE(std::any_of(items->begin(), items->end(), isExpected))
      << column.Name << ' ' << value.size() << "\n expected: " << expected << "\n in: " << text;
}

TEST(Items, ReadBackAtEveryWidth) {
  for (const auto& column : columns) {
    const std::string rest(column.Width - 1, 'x');
    const std::string_view kinds = column.Kinds;
    for (const Padding padding : {Padding::kRight, Padding::kLeft}) {
      Check(column, rest, kinds[0], padding);
      Check(column, rest + "x", kinds[1], padding);
      Check(column, rest + "xx", kinds[2], padding);
      Check(column, "xxxxxx", 'f', padding);
    }
    if (kinds.size() == 4) {  // the blank is where the field ends or, padded on the left, begins
      Check(column, rest + " xxxx", kinds[3], Padding::kRight);
      Check(column, rest + " x", kinds[3], Padding::kRight);
      Check(column, "x x" + rest, kinds[3], Padding::kLeft);
    }
  }
}

}  // namespace
