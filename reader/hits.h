#pragma once

#include <functional>
#include <string_view>

#include "reader/history.h"

// A part of an event that contains the text searched for. All texts are UTF-8.
struct Hit {
  std::string_view Kind;  // "fact", "message" or "change"
  std::string_view Name;  // of the fact, or the section of the change; empty for a message
  std::string_view Text;  // the complete fact, message or change
};

// Calls the function with every fact, file name, message and change of the event that contains the
// text, in this order. The case of the letters A to Z does not count. The hit is valid during the
// call.
void ForEachHit(const Event& event, std::string_view text,
                const std::function<void(const Hit&)>& use);
