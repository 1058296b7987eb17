#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

// What a snapshot is read into: one item for each row of its tables.

enum class Section : uint8_t {
  kUser,
  kGroups,
  kMembers,
  kSoftware,
  kProcesses,
  kServices,
  kCopies,
  kProducts,
  kProfile,
  kInstances,
  kInstanceProfile,
  kDrivers,
  kDriverParameters,
};

inline constexpr size_t kSectionCount = 13;

// "user", "groups" and so on, as the JSON has it.
std::string_view SectionName(Section section);

// The names of the fields of a section's items, in the order of Item::Values.
std::span<const std::string_view> FieldNames(Section section);

// All texts are raw bytes of the report and views into it. The path and the name together are the
// identity of an item. Two items of a snapshot may have the same.
struct Item {
  Section Where = Section::kUser;
  uint8_t PathSize = 0;
  uint8_t FieldCount = 0;  // 0 if the columns of the row cannot be separated; then Name is the row
  std::array<std::string_view, 2> Path;
  std::string_view Name;
  std::array<std::string_view, 4> Values;
  size_t Count = 1;  // of a process: how many of this name
};
