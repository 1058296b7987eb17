#pragma once

#include <string_view>

#include "reader/item.h"
#include "reader/snapshot.h"

// Each of these sets the path, name and fields of an item from the row of a table, without its line
// feed. Widths are in bytes. If the columns cannot be separated for certain, the item has the whole
// row as its name, and no fields. For rows that the recorder cannot have written, the two functions
// with a result return false.

void ReadMemberRow(std::string_view row, Item& item);
void ReadSoftwareRow(std::string_view row, Item& item);
bool ReadProcessRow(std::string_view row, Item& item);
bool ReadServiceRow(std::string_view row, Item& item);
void ReadProductRow(std::string_view row, Padding padding, Item& item);
void ReadProfileRow(std::string_view row, Padding padding, Item& item);

// A row of a name, padded to the width, and a value.
void ReadParameterRow(std::string_view row, size_t width, Padding padding, Item& item);
