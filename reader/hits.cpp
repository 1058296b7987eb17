#include "reader/hits.h"

#include <algorithm>

#include "platform/ascii_case.h"
#include "reader/event_text.h"

static bool Contains(std::string_view text, std::string_view wanted) {
  return wanted.empty() ||
         std::search(text.begin(), text.end(), wanted.begin(), wanted.end(), [](char a, char b) {
           return ToLowerAscii(a) == ToLowerAscii(b);
         }) != text.end();
}

void ForEachHit(const Event& event, std::string_view text,
                const std::function<void(const Hit&)>& use) {
  const auto add = [&](std::string_view kind, std::string_view name, std::string_view content) {
    if (Contains(content, text)) {
      use({kind, name, content});
    }
  };
  for (const Fact& fact : FactsOf(event)) {
    add("fact", fact.Name, fact.Text);
  }
  for (const EventFile& file : event.Files) {
    add("fact", file.Key, file.Path);
  }
  ForEachMessage(event, [&](std::string_view message) { add("message", "", message); });
  for (const Change& change : event.Differences.List) {
    add("change", SectionName(change.Where), TextOfChange(change));
  }
}
