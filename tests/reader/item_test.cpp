// Rows of every table of a report, read into items.

#include <gtest/gtest.h>

#include "reader/report.h"
#include "tests/reader/history_text.h"

namespace {

// A column of a table. A row has its text, "@" for the value, padded to the width.
struct Column {
  const char* Name;
  size_t Width;
  const char* Text;
  const char* Value;
  // How rows read back whose text has one byte less than the width, exactly it and one more: 'f'
  // with fields, 'r' as the entire row. Then 's' if a blank in a longer value must end no column.
  const char* Kinds;
};

struct Table {
  size_t Part;
  const char* Head;  // of the last such table in the part
  // "section|path/path|", and of a row that has fields "name|field=value" with <column> for values.
  std::string Path;
  std::string Item;
  std::vector<Column> Columns;
};

const Table tables[] = {
    {0,
     "Group  ",
     "members|",
     "<group>|H\\m",
     {{"group", 30, "@", "Users", "fff"}, {"member", 0, "          H\\m", "", ""}}},
    {1,
     "Publisher ",
     "software|",
     "<publisher>|<name>|version=<version>|date=<date>|language=1033|location=C:\\ZEK",
     {{"publisher", 30, "@", "ZEK", "frrs"},
      {"name", 65, "@", "ORX Server", "frrs"},
      {"version", 20, "@", "9.4", "frrs"},
      {"date", 14, "@", "20261101", "frrs"},
      {"language", 11, "1033", "", ""},
      {"location", 0, "C:\\ZEK", "", ""}}},
    {3,
     "Service Name ",
     "services|",
     "<service>|state=The service pause is pending",
     {{"service", 60, "@", "", "fff"}, {"state", 0, "The service pause is pending", "", ""}}},
    {4,
     "Global Profiles:",
     "profile|C1|",
     "<name>|value=4096",
     {{"name", 30, "@:", "LogSize", "fff"}, {"value", 0, "4096", "", ""}}},
    {4,
     "Global Profiles:",
     "profile|C1|",
     "<name>|value=C:\\ZEK",
     {{"name", 30, "@:", "Folder", "frr"}, {"value", 0, "C:\\ZEK", "", ""}}},
    {4,
     "Product Name ",
     "products|C1|",
     "<product>|code=<code>|version=<version>.4.0|service_level=<level>|modified=<modified>",
     {{"product", 40, "@", "ORX Server", "ffrs"},
      {"code", 40, "@", "{1}", "ffrs"},
      {"version", 10, "@.4.0", "9", "ffrs"},
      {"level", 20, "@", "SL", "ffrs"},
      {"modified", 20, "@", "20261101", "fff"}}},
    {4,
     "Parameter Name ",
     "instance_profile|C1/ORX2|",
     "<name>|value=5",
     {{"name", 36, "@", "Port", "frr"}, {"value", 0, "5", "", ""}}},
    {5,
     "Parameter Name ",
     "driver_parameters|My ZEK ORX DRIVER - C1|",
     "<name>|value=5",
     {{"name", 30, "@", "Driver", "frr"}, {"value", 0, "5", "", ""}}},
};

std::string ItemsText(const std::vector<Item>& items) {
  std::string text;
  for (const Item& item : items) {
    text += SectionName(item.Where);
    for (size_t i = 0; i < item.PathSize; ++i) {
      text.append(i == 0 ? "|" : "/").append(item.Path[i]);
    }
    text.append("|").append(item.Name);
    for (size_t i = 0; i < item.FieldCount; ++i) {
      text.append("|").append(FieldNames(item.Where)[i]).append("=").append(item.Values[i]);
    }
    text += '\n';
  }
  return text;
}

// Reads a row with this value in one column. It is the first row of its table in the golden report.
void Check(const Table& table, const Column& column, const std::string& value, char kind,
           Padding padding) {
  std::string row;
  std::string item = table.Item;
  for (const Column& each : table.Columns) {
    const std::string content = &each == &column ? value : each.Value;
    const std::string text = Replaced(each.Text, "@", content);
    const std::string blanks(each.Width - std::min(each.Width, text.size()), ' ');
    row += padding == Padding::kLeft && table.Part > 3 ? blanks + text : text + blanks;
    item = Replaced(item, '<' + std::string(each.Name) + '>', content);
  }
  const std::string report = GoldenReport();
  std::string part(ParseReport(report, {}).back().After->Parts[table.Part].value());
  const size_t rule = part.find('\n', part.rfind(table.Head)) + 1;
  part.insert(part.find('\n', rule) + 1, row + '\n');
  const auto items = ReadItems(part, table.Part, padding);
  ASSERT_TRUE(items) << part;
  const std::string expected = '\n' + table.Path + (kind == 'f' ? item : row) + '\n';
  const std::string read = '\n' + ItemsText(*items);
  EXPECT_NE(read.find(expected), read.npos) << expected << read;
}

void CheckWidths(const Table& table, const Column& column) {
  const size_t width = column.Width + 1 - std::string(column.Text).size();
  for (const Padding padding : {Padding::kRight, Padding::kLeft}) {
    for (size_t i = 0; i < 3; ++i) {
      Check(table, column, std::string(width + i - 1, 'x'), column.Kinds[i], padding);
    }
    Check(table, column, "xxxxxx", 'f', padding);
  }
  // A blank where the field ends, or where it would begin if it were padded on the left.
  const std::string rest(width - 1, 'x');
  if (column.Kinds[3] == 's') {
    Check(table, column, rest + " xxxx", 'r', Padding::kRight);
    Check(table, column, rest + " x", 'r', Padding::kRight);
    Check(table, column, "x x" + rest, 'r', Padding::kLeft);
  }
}

TEST(Items, AreSeparatedAtEveryWidthUnlessALongValueShiftsTheColumns) {
  for (const Table& table : tables) {
    for (const Column& column : table.Columns) {
      if (*column.Kinds != '\0') {
        CheckWidths(table, column);
      }
    }
  }
}

}  // namespace
