#include "platform/posix/registry_tree.h"

#include <algorithm>
#include <utility>

#include "platform/ascii_case.h"

namespace {

// The first name of a path, which is taken off it.
std::string_view TakeName(std::string_view& path) {
  const std::string_view name = path.substr(0, path.find('\\'));
  path.remove_prefix(std::min(name.size() + 1, path.size()));
  return name;
}

bool HasEmptyName(std::string_view path) {
  return path.starts_with('\\') || path.ends_with('\\') ||
         path.find("\\\\") != std::string_view::npos;
}

}  // namespace

bool IsAtOrBelow(std::string_view path, std::string_view top) {
  const bool canBe = top.empty() || path.size() == top.size() ||
                     (path.size() > top.size() && path[top.size()] == '\\');
  return canBe && EqualsIgnoringCase(path.substr(0, top.size()), top);
}

RegistryTree::RegistryTree(const RegistryHeadings& headings, std::string top)
    : TopPath(std::move(top)), Keys(1) {
  for (size_t i = 0; i < headings.Count(); ++i) {
    const RegistryHeading heading = headings.At(i);
    if (heading.Kind == HeadingKind::kKey && IsAtOrBelow(heading.Path, TopPath)) {
      Add(heading);
    } else if (heading.Kind == HeadingKind::kRemoval &&
               (IsAtOrBelow(heading.Path, TopPath) || IsAtOrBelow(TopPath, heading.Path))) {
      Remove(heading.Path);
    }
  }
}

RegistryTree::Key* RegistryTree::Find(std::string_view path) {
  Key* key = &Keys.front();
  while (!path.empty()) {
    const size_t* number = key->SubKeys.Find(TakeName(path));
    if (number == nullptr) {
      return nullptr;
    }
    key = &Keys[*number];
  }
  return key;
}

void RegistryTree::Add(const RegistryHeading& heading) {
  if (HasEmptyName(heading.Path)) {
    return;
  }
  size_t key = 0;
  for (std::string_view rest = heading.Path; !rest.empty();) {
    size_t& number = Keys[key].SubKeys.FindOrAdd(TakeName(rest));
    if (number == 0) {
      number = Keys.size();
      key = number;
      Keys.emplace_back();
    } else {
      key = number;
    }
  }
  Keys[key].Headings.push_back(heading);
}

void RegistryTree::Remove(std::string_view path) {
  const size_t parentEnd = path.rfind('\\');
  const bool isTopLevel = parentEnd == std::string_view::npos;
  Key* parent = Find(isTopLevel ? "" : path.substr(0, parentEnd));
  if (parent != nullptr) {
    parent->SubKeys.Remove(isTopLevel ? path : path.substr(parentEnd + 1));
  }
}
