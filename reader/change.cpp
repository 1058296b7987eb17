#include "reader/change.h"

#include <algorithm>
#include <numeric>
#include <span>
#include <tuple>
#include <unordered_map>

#include "reader/limits.h"

namespace {

using Items = std::vector<Item>;

// Indices into the items of a snapshot.
using Indices = std::vector<size_t>;

auto IdentityOf(const Item& item) {
  // The number of fields is part of it: a row whose columns could not be separated has none, and is
  // never a changed form of one with fields.
  return std::tie(item.Where, item.Path, item.Name, item.FieldCount);
}

auto ContentOf(const Item& item) { return std::tie(item.Values, item.Count); }

// Makes one item of all processes of a name, with their number.
void CountProcesses(Items& items) {
  std::unordered_map<std::string_view, size_t> indices;  // in the list below
  Items counted;
  for (const Item& item : items) {
    const auto [entry, isNew] = indices.try_emplace(item.Name, counted.size());
    if (isNew) {
      counted.push_back(item);
    } else {
      ++counted[entry->second].Count;
    }
  }
  items = std::move(counted);
}

std::optional<Items> ReadPart(const Snapshot& snapshot, size_t part) {
  std::optional<Items> items =
      ReadItems(*snapshot.Parts[part], part, PaddingOfPart(snapshot, part));
  if (items && part == PartOf(Section::kProcesses)) {
    CountProcesses(*items);
  }
  return items;
}

Indices SortedByIdentity(const Items& items) {
  Indices sorted(items.size());
  std::iota(sorted.begin(), sorted.end(), size_t{0});
  std::stable_sort(sorted.begin(), sorted.end(), [&items](size_t a, size_t b) {
    return std::tuple(IdentityOf(items[a]), ContentOf(items[a])) <
           std::tuple(IdentityOf(items[b]), ContentOf(items[b]));
  });
  return sorted;
}

class Comparison {
 public:
  Comparison(const Items& before, const Items& after) : Before(before), After(after) {
    const Indices old = SortedByIdentity(before);
    const Indices now = SortedByIdentity(after);
    for (size_t i = 0, j = 0; i < old.size() || j < now.size();) {
      const bool hasOld = i < old.size();
      const bool hasNow = j < now.size();
      const bool isOld =
          hasOld && (!hasNow || IdentityOf(before[old[i]]) <= IdentityOf(after[now[j]]));
      const Item& identity = isOld ? before[old[i]] : after[now[j]];
      const size_t oldEnd = EndOfIdentity(before, old, i, identity);
      const size_t nowEnd = EndOfIdentity(after, now, j, identity);
      Pair(std::span(old).subspan(i, oldEnd - i), std::span(now).subspan(j, nowEnd - j));
      i = oldEnd;
      j = nowEnd;
    }
    std::sort(Changed.begin(), Changed.end());
    std::sort(Removed.begin(), Removed.end());
    std::sort(Added.begin(), Added.end());
  }

  std::vector<std::pair<size_t, size_t>> Changed;  // before, after
  Indices Removed;
  Indices Added;

 private:
  static size_t EndOfIdentity(const Items& items, const Indices& sorted, size_t begin,
                              const Item& identity) {
    size_t end = begin;
    while (end < sorted.size() && IdentityOf(items[sorted[end]]) == IdentityOf(identity)) {
      ++end;
    }
    return end;
  }

  // The items of one identity, sorted by their fields.
  void Pair(std::span<const size_t> old, std::span<const size_t> now) {
    Indices oldRest;
    Indices nowRest;
    size_t i = 0;
    size_t j = 0;
    while (i < old.size() && j < now.size()) {
      const auto oldContent = ContentOf(Before[old[i]]);
      const auto nowContent = ContentOf(After[now[j]]);
      if (oldContent == nowContent) {
        ++i;
        ++j;
      } else if (oldContent < nowContent) {
        oldRest.push_back(old[i++]);
      } else {
        nowRest.push_back(now[j++]);
      }
    }
    oldRest.insert(oldRest.end(), old.begin() + static_cast<ptrdiff_t>(i), old.end());
    nowRest.insert(nowRest.end(), now.begin() + static_cast<ptrdiff_t>(j), now.end());
    PairRest(oldRest, nowRest);
  }

  void PairRest(Indices& old, Indices& now) {
    std::sort(old.begin(), old.end());
    std::sort(now.begin(), now.end());
    const size_t pairs = std::min(old.size(), now.size());
    for (size_t i = 0; i < pairs; ++i) {
      Changed.emplace_back(old[i], now[i]);
    }
    Removed.insert(Removed.end(), old.begin() + static_cast<ptrdiff_t>(pairs), old.end());
    Added.insert(Added.end(), now.begin() + static_cast<ptrdiff_t>(pairs), now.end());
  }

  const Items& Before;
  const Items& After;
};

class ChangeWriter {
 public:
  ChangeWriter(const TextDecoder& decoder, ChangeDetail detail, Changes& changes)
      : Decoder(decoder), Detail(detail), Result(changes) {}

  // One of the two items may be null.
  void Write(ChangeKind kind, const Item* before, const Item* after) {
    const Item& item = before != nullptr ? *before : *after;
    Result.Differs[static_cast<size_t>(item.Where)] = true;
    if (Detail == ChangeDetail::kCounts || Result.Bytes >= kMostBytesOfEvent) {
      return;
    }
    Change& change = Result.List.emplace_back();
    change.Kind = kind;
    change.Where = item.Where;
    for (size_t i = 0; i < item.PathSize; ++i) {
      change.Path.push_back(Decoder.ToUtf8(item.Path[i]));
    }
    change.Name = Decoder.ToUtf8(item.Name);
    for (size_t i = 0; i < item.FieldCount; ++i) {
      const auto old = Value(before, i);
      const auto now = Value(after, i);
      if (old != now) {
        change.Fields.push_back({FieldNames(item.Where)[i], old, now});
      }
    }
    Result.Bytes += BytesOf(change);
  }

 private:
  static size_t BytesOf(const Change& change) {
    size_t bytes = sizeof change + change.Name.capacity();
    for (const std::string& part : change.Path) {
      bytes += sizeof(std::string) + part.capacity();
    }
    for (const FieldChange& field : change.Fields) {
      bytes += sizeof field + (field.Before ? field.Before->size() : 0) +
               (field.After ? field.After->size() : 0);
    }
    return bytes;
  }

  std::optional<std::string> Value(const Item* item, size_t field) const {
    if (item == nullptr) {
      return std::nullopt;
    }
    return item->Where == Section::kProcesses ? std::to_string(item->Count)
                                              : Decoder.ToUtf8(item->Values[field]);
  }

  const TextDecoder& Decoder;
  ChangeDetail Detail;
  Changes& Result;
};

void ComparePart(const Items& before, const Items& after, const TextDecoder& decoder,
                 ChangeDetail detail, Changes& changes) {
  const Comparison comparison(before, after);
  changes.Counts.Added += comparison.Added.size();
  changes.Counts.Removed += comparison.Removed.size();
  changes.Counts.Changed += comparison.Changed.size();
  ChangeWriter writer(decoder, detail, changes);
  for (const auto& [old, now] : comparison.Changed) {
    writer.Write(ChangeKind::kChanged, &before[old], &after[now]);
  }
  for (const size_t old : comparison.Removed) {
    writer.Write(ChangeKind::kRemoved, &before[old], nullptr);
  }
  for (const size_t now : comparison.Added) {
    writer.Write(ChangeKind::kAdded, nullptr, &after[now]);
  }
}

}  // namespace

std::string_view ChangeName(ChangeKind kind) {
  switch (kind) {
    case ChangeKind::kAdded:
      return "added";
    case ChangeKind::kRemoved:
      return "removed";
    default:
      return "changed";
  }
}

Changes CompareSnapshots(const Snapshot& before, const Snapshot& after, const TextDecoder& decoder,
                         ChangeDetail detail) {
  Changes changes;
  std::array<bool, kSnapshotParts> isCompared = {};
  for (size_t part = 0; part < kSnapshotParts; ++part) {
    if (!before.Parts[part] || !after.Parts[part]) {
      continue;
    }
    if (before.Parts[part] == after.Parts[part]) {
      isCompared[part] = true;
      continue;
    }
    const auto old = ReadPart(before, part);
    const auto now = ReadPart(after, part);
    if (old && now) {
      isCompared[part] = true;
      ComparePart(*old, *now, decoder, detail, changes);
    }
  }
  for (size_t i = 0; i < kSectionCount; ++i) {
    changes.Compared[i] = isCompared[PartOf(static_cast<Section>(i))];
  }
  std::stable_sort(changes.List.begin(), changes.List.end(),
                   [](const Change& a, const Change& b) { return a.Where < b.Where; });
  return changes;
}
