// Archives: any bytes are an archive. What can be read is a history whose texts, printed and as
// JSON, are valid UTF-8 without a control character; what cannot be read is a finding or one line.

#include <algorithm>
#include <cstring>
#include <string>

#include "fuzz/support.h"
#include "reader/check.h"
#include "reader/history.h"
#include "reader/json.h"
#include "reader/source.h"
#include "reader/views.h"

namespace {

bool IsHarmless(const std::string& text) {
  return IsUtf8(text) && text.find("\u009B") == std::string::npos &&
         std::none_of(text.begin(), text.end(),
                      [](char c) { return (c >= 0 && c < ' ' && c != '\n') || c == '\x7F'; });
}

void Show(const History& history) {
  std::vector<const Event*> events;
  for (const Event& event : history.Events) {
    events.push_back(&event);
    Require(IsHarmless(ShowText(event, {})));
    Require(IsHarmless(ChangesText(event, {60, false, true})));
    Require(IsHarmless(EventDetailsJson(history.Source, event)));
  }
  Require(IsHarmless(ListText(events, {60, false, false})));
  Require(IsHarmless(FindingsText(CheckHistory(history), {})));
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
    Require(!error.empty() && IsHarmless(error));
    return 0;
  }
  Show(ReadHistory(*source, TextDecoder(), Detail::kAll));
  for (const Finding& finding : source->Findings) {
    Require(IsUtf8(finding.Text));
  }
  return 0;
}
