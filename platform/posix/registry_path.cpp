#include "platform/posix/registry_path.h"

#include <algorithm>

#include "platform/ascii_case.h"

bool IsAtOrBelow(std::string_view path, std::string_view top) {
  const bool canBe = top.empty() || path.size() == top.size() ||
                     (path.size() > top.size() && path[top.size()] == '\\');
  return canBe && EqualsIgnoringCase(path.substr(0, top.size()), top);
}

std::string_view TakeFirstName(std::string_view& path) {
  const std::string_view name = path.substr(0, path.find('\\'));
  path.remove_prefix(std::min(name.size() + 1, path.size()));
  return name;
}

std::string_view ParentOf(std::string_view path) {
  const size_t end = path.rfind('\\');
  return end == std::string_view::npos ? "" : path.substr(0, end);
}

std::string_view LastNameOf(std::string_view path) { return path.substr(path.rfind('\\') + 1); }

bool HasEmptyName(std::string_view path) {
  return path.starts_with('\\') || path.ends_with('\\') ||
         path.find("\\\\") != std::string_view::npos;
}
