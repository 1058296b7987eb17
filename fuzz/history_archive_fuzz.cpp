// Archives: any bytes are an archive. What can be read is a history whose texts, printed and as
// JSON, are valid UTF-8 without a control character; what cannot be read is a finding or one line.

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <string>

#include "reader/check.h"
#include "reader/history.h"
#include "reader/json.h"
#include "reader/source.h"
#include "reader/views.h"

namespace {

void Demand(bool isTrue) {
  if (!isTrue) {
    std::abort();
  }
}

bool IsHarmless(const std::string& text) {
  return IsUtf8(text) && std::none_of(text.begin(), text.end(), [](char c) {
           return (c >= 0 && c < ' ' && c != '\n') || c == '\x7F';
         });
}

void Show(const History& history) {
  std::vector<const Event*> events;
  for (const Event& event : history.Events) {
    events.push_back(&event);
    Demand(IsHarmless(ShowText(event, {})));
    Demand(IsHarmless(ChangesText(event, {60, false, true})));
    Demand(IsHarmless(EventDetailsJson(history.Source, event)));
  }
  Demand(IsHarmless(ListText(events, {60, false, false})));
  Demand(IsHarmless(FindingsText(CheckHistory(history), {})));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const ArchiveBytes bytes = {size, [=](uint64_t offset, char* buffer, size_t wanted) {
                                const size_t begin = std::min<uint64_t>(offset, size);
                                const size_t count = std::min(wanted, size - begin);
                                std::memcpy(buffer, data + begin, count);
                                return count;
                              }};
  std::string error;
  const std::unique_ptr<Source> source = OpenArchive(bytes, error);
  if (!source) {
    Demand(!error.empty() && IsHarmless(error));
    return 0;
  }
  Show(ReadHistory(*source, TextDecoder(), Detail::kAll));
  for (const Finding& finding : source->Findings) {
    Demand(IsUtf8(finding.Text));
  }
  return 0;
}
