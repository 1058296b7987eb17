// Archives: any bytes are an archive. What can be read is a history whose texts, printed and as
// JSON, are valid UTF-8 without a control character; what cannot be read is a finding or one line.

#include "fuzz/support.h"
#include "reader/check.h"
#include "reader/history.h"
#include "reader/json.h"
#include "reader/views.h"

static void RequireHarmless(const std::string& text, int line = __builtin_LINE()) {
  Require(IsUtf8(text) && text.find("\u009B") == std::string::npos, line);
  Require(std::none_of(text.begin(), text.end(),
                       [](char c) { return (c >= 0 && c < ' ' && c != '\n') || c == '\x7F'; }),
          line);
}

void CheckInput(const std::string& input) {
  std::string error;
  const std::unique_ptr<Source> source = OpenArchive({input.size(), ReaderOf(input)}, error);
  if (!source) {
    Require(!error.empty());
    RequireHarmless(error);
    return;
  }
  const History history = ReadHistory(*source, TextDecoder(), Detail::kAll);
  std::vector<const Event*> events;
  for (const Event& event : history.Events) {
    events.push_back(&event);
    RequireHarmless(ShowText(event, {}));
    RequireHarmless(ChangesText(event, {60, false, true}));
    RequireHarmless(EventDetailsJson(history.Source, event));
  }
  RequireHarmless(ListText(events, {60, false, false}));
  RequireHarmless(FindingsText(CheckHistory(history), {}));
  for (const Finding& finding : source->Findings) {
    Require(IsUtf8(finding.Text));
  }
}
