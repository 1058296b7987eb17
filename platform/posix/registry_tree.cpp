#include "platform/posix/registry_tree.h"

#include <utility>

#include "platform/posix/registry_path.h"

RegistryTree::RegistryTree(RegistryHeadings& headings, const std::vector<RegistryStretch>& map,
                           std::string top)
    : TopPath(std::move(top)), Keys(1) {
  for (const RegistryStretch& stretch : map) {
    const bool isRelated = IsAtOrBelow(stretch.Part, TopPath) || IsAtOrBelow(TopPath, stretch.Part);
    if (stretch.Kind != HeadingKind::kOther && isRelated) {
      EndLines(headings.Visit(stretch.Begin, stretch.End,
                              [this](const RegistryHeading& heading) { Take(heading); }));
    }
  }
}

// Lines end where the next heading begins, whatever that is of.
void RegistryTree::EndLines(uint64_t end) {
  if (OpenLines != nullptr) {
    OpenLines->End = end;
    OpenLines = nullptr;
  }
}

void RegistryTree::Take(const RegistryHeading& heading) {
  EndLines(heading.Begin);
  if (heading.Kind == HeadingKind::kRemoval) {
    Remove(heading.Path);
  } else if (heading.Kind == HeadingKind::kKey && IsAtOrBelow(heading.Path, TopPath) &&
             !HasEmptyName(heading.Path)) {
    std::vector<Lines>& places = Keys[FindOrAdd(BelowTop(heading.Path))].Places;
    places.push_back({heading.Begin, heading.Begin});
    OpenLines = &places.back();
  }
}

RegistryTree::Key* RegistryTree::Find(std::string_view path) {
  Key* key = &Keys.front();
  for (std::string_view rest = BelowTop(path); !rest.empty();) {
    const size_t* number = key->SubKeys.Find(TakeFirstName(rest));
    if (number == nullptr) {
      return nullptr;
    }
    key = &Keys[*number];
  }
  return key;
}

std::string_view RegistryTree::BelowTop(std::string_view path) const {
  const bool isTop = path.size() == TopPath.size();
  return path.substr(TopPath.size() + (isTop || TopPath.empty() ? 0 : 1));
}

size_t RegistryTree::FindOrAdd(std::string_view path) {
  size_t key = 0;
  while (!path.empty()) {
    size_t& number = Keys[key].SubKeys.FindOrAdd(TakeFirstName(path));
    if (number != 0) {
      key = number;
      continue;
    }
    key = Keys.size();
    number = key;
    Keys.emplace_back();
  }
  return key;
}

void RegistryTree::Remove(std::string_view path) {
  if (IsAtOrBelow(TopPath, path)) {
    Keys.clear();
    Keys.resize(1);
    return;
  }
  if (!IsAtOrBelow(path, TopPath)) {
    return;
  }
  Key* parent = Find(ParentOf(path));
  if (parent != nullptr) {
    parent->SubKeys.Remove(LastNameOf(path));
  }
}
