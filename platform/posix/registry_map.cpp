#include "platform/posix/registry_map.h"

#include <limits>
#include <string_view>

static std::string_view PartOf(std::string_view path) {
  size_t end = path.find('\\');
  for (int names = 1; names < 3 && end != std::string_view::npos; ++names) {
    end = path.find('\\', end + 1);
  }
  return path.substr(0, end);
}

std::vector<RegistryStretch> MapRegistry(RegistryHeadings& headings, uint64_t begin) {
  std::vector<RegistryStretch> map;
  const auto add = [&map](const RegistryHeading& heading) {
    const bool isOther = heading.Kind == HeadingKind::kOther;
    const std::string_view part = PartOf(heading.Path);
    if (!map.empty()) {
      if (map.back().Part == part && (map.back().Kind == HeadingKind::kOther) == isOther) {
        return;
      }
      map.back().End = heading.Begin;
    }
    map.push_back({heading.Kind, std::string(part), heading.Begin});
  };
  const uint64_t end = headings.Visit(begin, std::numeric_limits<uint64_t>::max(), add);
  if (!map.empty()) {
    map.back().End = end;
  }
  return map;
}
