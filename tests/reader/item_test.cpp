// Every table of a report, written by the recorder's Print and read back.

#include <gtest/gtest.h>

#include <functional>
#include <ios>

#include "eventlog/logger.h"
#include "inventory/process_list.h"
#include "inventory/service_list.h"
#include "inventory/software_list.h"
#include "inventory/user_list.h"
#include "products/copy_generation.h"
#include "products/odbc_drivers.h"
#include "products/products_list.h"
#include "reader/snapshot.h"
#include "tests/reader/item_text.h"
#include "tests/support/fake_machine.h"
#include "tests/support/run_tool.h"

namespace {

using Printer = std::function<void(const std::string& value)>;

// A column, printed with values of about its width.
struct Column {
  const char* Name;
  size_t Part;
  size_t Width;
  Printer Print;
  // The item, with "@" for the value.
  std::string Item;
  // How rows read back with one byte less than the width, exactly it and one more: 'f' with fields,
  // 'r' as the whole row.
  const char* Kinds;
};

CProductInfo Software() {
  CProductInfo product;
  product.Publisher = "ZEK";
  product.DisplayName = "Server";
  product.DisplayVersion = "9.4";
  product.InstallDate = "20261101";
  product.InstallLocation = "C:\\ZEK";
  product.Language = 1033;
  return product;
}

Printer PrintSoftware(std::string CProductInfo::*field) {
  return [field](const std::string& value) {
    CProductsList list;
    list.Products = {Software()};
    list.Products[0].*field = value;
    // Printed whatever the publisher is.
    list.Products[0].Publisher.replace(0, 3, "ZEK");
    list.Print();
  };
}

CORXCopy Copy() {
  CORXCopy copy("C1");
  CORXProduct product("C1", "ORX Server");
  product.ProductCode = "{1}";
  product.VersionInfo = {"9", "4", "0", "SL"};
  product.LastModifiedDate = "20261101";
  copy.Products = {product};
  return copy;
}

void PrintCopies(const CORXCopy& copy) {
  for (const int32_t generation : {0, 1}) {
    SetCopyGeneration(generation);
    CORXProductsList list;
    if (generation == 1) {
      list.Copies = {copy};
    }
    list.Print();
  }
}

Printer PrintProduct(std::string CORXProduct::*field) {
  return [field](const std::string& value) {
    CORXCopy copy = Copy();
    copy.Products[0].*field = value;
    PrintCopies(copy);
  };
}

Printer PrintVersion(std::string CORXVersion::*field) {
  return [field](const std::string& value) {
    CORXCopy copy = Copy();
    copy.Products[0].VersionInfo.*field = value;
    PrintCopies(copy);
  };
}

void PrintProfile(const std::string& name) {
  CORXCopy copy = Copy();
  copy.GlobalProfile = {{name, "4096"}};
  PrintCopies(copy);
}

void PrintProfileWithColons(const std::string& name) {
  CORXCopy copy = Copy();
  copy.GlobalProfile = {{name, "C:\\ZEK"}};
  PrintCopies(copy);
}

void PrintInstance(const std::string& name) {
  CORXCopy copy = Copy();
  copy.Instances = {CORXInstance("C1", "I1")};
  copy.Instances[0].Parameters = {{name, "5"}};
  PrintCopies(copy);
}

void PrintDriver(const std::string& name) {
  CODBCDriversList list;
  list.Drivers = {CODBCDriver("ZEK ORX")};
  list.Drivers[0].Parameters = {{name, "5"}};
  list.Print();
}

void PrintMember(const std::string& group) {
  CUsersList list;
  list.LoggedOnUser = "H\\u";
  list.LocalGroups = {group};
  list.LocalMembers = {{"H\\m", group}};
  list.Print();
}

void PrintService(const std::string& name) {
  CServicesList list;
  list.Services = {{"s", "ORX" + name.substr(3), "The service pause is pending"}};
  list.Print();
}

const Column columns[] = {
    {"group", 0, 30, PrintMember, "members|@|H\\m", "fff"},
    {"publisher", 1, 30, PrintSoftware(&CProductInfo::Publisher),
     "software|ZEK@|Server|version=9.4|date=20261101|language=1033|location=C:\\ZEK", "frr"},
    {"software", 1, 65, PrintSoftware(&CProductInfo::DisplayName),
     "software|ZEK|@|version=9.4|date=20261101|language=1033|location=C:\\ZEK", "frr"},
    {"software version", 1, 20, PrintSoftware(&CProductInfo::DisplayVersion),
     "software|ZEK|Server|version=@|date=20261101|language=1033|location=C:\\ZEK", "frr"},
    {"date", 1, 14, PrintSoftware(&CProductInfo::InstallDate),
     "software|ZEK|Server|version=9.4|date=@|language=1033|location=C:\\ZEK", "frr"},
    {"location", 1, 99, PrintSoftware(&CProductInfo::InstallLocation),
     "software|ZEK|Server|version=9.4|date=20261101|language=1033|location=@", "fff"},
    {"service", 3, 60, PrintService, "services|ORX@|state=The service pause is pending", "fff"},
    {"profile", 4, 29, PrintProfile, "profile|C1|@|value=4096", "fff"},
    {"profile, a colon in the value", 4, 29, PrintProfileWithColons, "profile|C1|@|value=C:\\ZEK",
     "frr"},
    {"product", 4, 40, PrintProduct(&CORXProduct::Name),
     "products|C1|@|code={1}|version=9.4.0|service_level=SL|modified=20261101", "ffr"},
    {"code", 4, 40, PrintProduct(&CORXProduct::ProductCode),
     "products|C1|ORX Server|code=@|version=9.4.0|service_level=SL|modified=20261101", "ffr"},
    {"version", 4, 6, PrintVersion(&CORXVersion::Version),
     "products|C1|ORX Server|code={1}|version=@.4.0|service_level=SL|modified=20261101", "ffr"},
    {"service level", 4, 20, PrintVersion(&CORXVersion::ServiceLevel),
     "products|C1|ORX Server|code={1}|version=9.4.0|service_level=@|modified=20261101", "ffr"},
    {"modified", 4, 20, PrintProduct(&CORXProduct::LastModifiedDate),
     "products|C1|ORX Server|code={1}|version=9.4.0|service_level=SL|modified=@", "fff"},
    {"parameter of an instance", 4, 36, PrintInstance, "instance_profile|C1/I1|@|value=5", "frr"},
    {"parameter of a driver", 5, 30, PrintDriver, "driver_parameters|ZEK ORX|@|value=5", "frr"},
};

std::string Printed(const Column& column, const std::string& value, Padding padding) {
  return LoggedText([&] {
    CLogger::GetInstance() << (padding == Padding::kRight ? std::left : std::right);
    column.Print(value);
  });
}

// The text as the line in which the value is, which the whole row is.
std::string RowWith(const std::string& text, const std::string& value) {
  const size_t place = text.rfind(value);
  const size_t begin = text.rfind('\n', place) + 1;
  return text.substr(begin, text.find('\n', place) - begin);
}

void Check(const Column& column, const std::string& value, char kind, Padding padding) {
  const std::string text = Printed(column, value, padding);
  const auto items = ReadItems(text, column.Part, padding);
  ASSERT_TRUE(items) << column.Name << '\n' << text;
  const std::vector<std::string> all = ItemTexts(*items);
  // The first three letters of some values are fixed by a filter.
  const std::string rest =
      column.Item.find("ZEK@") != std::string::npos || column.Item.find("ORX@") != std::string::npos
          ? value.substr(3)
          : value;
  std::string expected = column.Item;
  expected.replace(expected.find('@'), 1, rest);
  const std::string row = RowWith(text, rest);
  const std::string name = kind == 'f' ? expected : '|' + row;
  EXPECT_TRUE(std::any_of(
      all.begin(), all.end(),
      [&](const std::string& item) { return kind == 'f' ? item == name : item.ends_with(name); }))
      << column.Name << ' ' << value.size() << "\n expected: " << name
      << "\n read: " << ::testing::PrintToString(all);
}

TEST(Items, ReadBackAtEveryWidth) {
  for (const Column& column : columns) {
    for (const Padding padding : {Padding::kRight, Padding::kLeft}) {
      Machine() = FakeMachine();
      for (size_t i = 0; i < 3; ++i) {
        const std::string value(column.Width + i - 1, 'x');
        Check(column, value, column.Kinds[i], padding);
      }
      Check(column, "xxxxxx", 'f', padding);
    }
  }
}

// An overlong value with a blank where its field ends, or where it would begin if it were padded on
// the left, shifts the columns after it.
TEST(Items, AreNotReadFromShiftedColumns) {
  for (const Column& column : columns) {
    const bool hasMoreColumns = column.Part == 1 || column.Item.starts_with("products");
    if (!hasMoreColumns || column.Kinds[2] == 'f') {
      continue;
    }
    const std::string rest(column.Width - 1, 'x');
    Check(column, rest + " xxxx", 'r', Padding::kRight);
    Check(column, rest + " x", 'r', Padding::kRight);
    Check(column, "x x" + rest, 'r', Padding::kLeft);
  }
}

}  // namespace
