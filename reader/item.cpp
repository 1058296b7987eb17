#include "reader/item.h"

std::string_view SectionName(Section section) {
  static constexpr std::array<std::string_view, kSectionCount> names = {"user",
                                                                        "groups",
                                                                        "members",
                                                                        "software",
                                                                        "processes",
                                                                        "services",
                                                                        "copies",
                                                                        "products",
                                                                        "profile",
                                                                        "instances",
                                                                        "instance_profile",
                                                                        "drivers",
                                                                        "driver_parameters"};
  return names[static_cast<size_t>(section)];
}

std::span<const std::string_view> FieldNames(Section section) {
  static constexpr std::string_view software[] = {"version", "date", "language", "location"};
  static constexpr std::string_view products[] = {"code", "version", "service_level", "modified"};
  static constexpr std::string_view count[] = {"count"};
  static constexpr std::string_view state[] = {"state"};
  static constexpr std::string_view value[] = {"value"};
  switch (section) {
    case Section::kSoftware:
      return software;
    case Section::kProducts:
      return products;
    case Section::kProcesses:
      return count;
    case Section::kServices:
      return state;
    case Section::kProfile:
    case Section::kInstanceProfile:
    case Section::kDriverParameters:
      return value;
    default:
      return {};
  }
}
