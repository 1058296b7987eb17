#include <string>

#include "platform/ascii_case.h"
#include "reader/history.h"

static bool IsWholeNumber(std::string_view text) {
  if (text.starts_with('-') || text.starts_with('+')) {
    text.remove_prefix(1);
  }
  return !text.empty() && text.find_first_not_of("0123456789") == text.npos;
}

std::string_view StateName(EventState state) {
  switch (state) {
    case EventState::kOpen:
      return "open";
    case EventState::kNoStart:
      return "no start";
    case EventState::kOk:
      return "ok";
    case EventState::kFailed:
      return "failed";
    default:
      return "ended";
  }
}

EventState StateOfResult(std::string_view result) {
  for (const std::string_view word : {"successful", "success", "ok", "0", "1641", "3010"}) {
    if (EqualsIgnoringCase(result, word)) {
      return EventState::kOk;
    }
  }
  const std::string lowered = LoweredAscii(result);
  for (const std::string_view word : {"fail", "error", "abort", "cancel", "rolled back"}) {
    if (lowered.find(word) != lowered.npos) {
      return EventState::kFailed;
    }
  }
  return IsWholeNumber(result) ? EventState::kFailed : EventState::kEnded;
}
