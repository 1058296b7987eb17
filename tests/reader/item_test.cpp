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
  // 'r' as the entire row.
  const char* Kinds;
};

Printer PrintSoftware(std::string CProductInfo::*field) {
  return [field](const std::string& value) {
    CProductInfo product = {"Server", "9.4", "20261101", "C:\\ZEK", "ZEK", 1033};
    product.*field = value;
    product.Publisher.replace(0, 3, "ZEK");  // others are not printed
    CProductsList list;
    list.Products = {product};
    list.Print();
  };
}

// The copies of both generations: none, and one that the value changes.
Printer PrintCopy(const std::function<void(CORXCopy&, const std::string&)>& change) {
  return [change](const std::string& value) {
    SetCopyGeneration(0);
    CORXProductsList().Print();
    CORXProduct product("C1", "ORX Server");
    product.ProductCode = "{1}";
    product.VersionInfo = {"9", "4", "0", "SL"};
    product.LastModifiedDate = "20261101";
    CORXProductsList list;
    list.Copies = {CORXCopy("C1")};
    list.Copies[0].Products = {product};
    change(list.Copies[0], value);
    SetCopyGeneration(1);
    list.Print();
  };
}

Printer PrintProduct(std::string CORXProduct::*field) {
  return PrintCopy([field](CORXCopy& copy, const auto& value) { copy.Products[0].*field = value; });
}

Printer PrintVersion(std::string CORXVersion::*field) {
  return PrintCopy([field](CORXCopy& copy, const std::string& value) {
    copy.Products[0].VersionInfo.*field = value;
  });
}

Printer PrintProfile(const std::string& text) {
  return PrintCopy([text](CORXCopy& copy, const auto& name) {
    copy.GlobalProfile = {{name, text}};
  });
}

void ChangeInstance(CORXCopy& copy, const std::string& name) {
  copy.Instances = {CORXInstance("C1", "I1")};
  copy.Instances[0].Parameters = {{name, "5"}};
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
    {"profile", 4, 29, PrintProfile("4096"), "profile|C1|@|value=4096", "fff"},
    {"profile, a colon in the value", 4, 29, PrintProfile("C:\\ZEK"), "profile|C1|@|value=C:\\ZEK",
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
    {"parameter of an instance", 4, 36, PrintCopy(ChangeInstance),
     "instance_profile|C1/I1|@|value=5", "frr"},
    {"parameter of a driver", 5, 30, PrintDriver, "driver_parameters|ZEK ORX|@|value=5", "frr"},
};

std::string Printed(const Column& column, const std::string& value, Padding padding) {
  return LoggedText([&] {
    CLogger::GetInstance() << (padding == Padding::kRight ? std::left : std::right);
    column.Print(value);
  });
}

// The text as the line in which the value is, which is the entire row.
std::string RowWith(const std::string& text, const std::string& value) {
  const size_t found = text.rfind(value);
  const size_t begin = text.rfind('\n', found) + 1;
  return text.substr(begin, text.find('\n', found) - begin);
}

void Check(const Column& column, const std::string& value, char kind, Padding padding) {
  const std::string text = Printed(column, value, padding);
  const auto items = ReadItems(text, column.Part, padding);
  ASSERT_TRUE(items) << column.Name << '\n' << text;
  // The first three letters of some values are fixed by a filter.
  const bool isFiltered = column.Item.find("ZEK@") != std::string::npos ||
                          column.Item.find("ORX@") != std::string::npos;
  const std::string rest = value.substr(isFiltered ? 3 : 0);
  const std::string expected =
      kind == 'f' ? Replaced(column.Item, "@", rest) : '|' + RowWith(text, rest);
  EXPECT_TRUE(std::any_of(items->begin(), items->end(),
                          [&](const Item& item) {
                            const std::string read = ItemText(item);
                            return kind == 'f' ? read == expected : read.ends_with(expected);
                          }))
      << column.Name << ' ' << value.size() << "\n expected: " << expected << "\n in: " << text;
}

TEST(Items, ReadBackAtEveryWidth) {
  for (const Column& column : columns) {
    for (const Padding padding : {Padding::kRight, Padding::kLeft}) {
      for (size_t i = 0; i < 3; ++i) {
        Check(column, std::string(column.Width + i - 1, 'x'), column.Kinds[i], padding);
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
    const std::string rest(column.Width - 1, 'x');
    if (hasMoreColumns && column.Kinds[2] != 'f') {
      Check(column, rest + " xxxx", 'r', Padding::kRight);
      Check(column, rest + " x", 'r', Padding::kRight);
      Check(column, "x x" + rest, 'r', Padding::kLeft);
    }
  }
}

}  // namespace
