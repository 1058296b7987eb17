#pragma once

#include <algorithm>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "platform/ascii_case.h"

// Named things in the order in which they came. A name is found without regard to case and given
// back as it was first written.
template <typename Item>
class RegistryNames {
 public:
  // The item of that name, made behind all others if there is none yet.
  Item& FindOrAdd(std::string_view name) {
    const auto [place, isNew] = Places.try_emplace(Folded(name), Entries.size());
    if (isNew) {
      Entries.push_back({std::string(name), Item(), false});
    }
    return Entries[place->second].Content;
  }

  // The item of that name, or null.
  Item* Find(std::string_view name) {
    const auto place = Places.find(Folded(name));
    return place == Places.end() ? nullptr : &Entries[place->second].Content;
  }

  void Remove(std::string_view name) {
    const auto place = Places.find(Folded(name));
    if (place != Places.end()) {
      // The places of the others must hold.
      Entries[place->second] = {"", Item(), true};
      Places.erase(place);
    }
  }

  std::vector<std::string> Names() const {
    std::vector<std::string> names;
    for (const Entry& entry : Entries) {
      if (!entry.IsRemoved) {
        names.push_back(entry.Name);
      }
    }
    return names;
  }

 private:
  struct Entry {
    std::string Name;
    Item Content;
    bool IsRemoved;
  };

  static std::string Folded(std::string_view name) {
    std::string folded(name);
    std::transform(folded.begin(), folded.end(), folded.begin(), ToLowerAscii);
    return folded;
  }

  std::vector<Entry> Entries;
  std::unordered_map<std::string, size_t> Places;  // by the name in small letters
};
