#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "reader/history.h"

// A part of an event that contains the text searched for. All texts are UTF-8.
struct Hit {
  std::string_view Kind;  // "fact", "message" or "change"
  std::string Name;       // of the fact, or the section of the change; empty for a message
  std::string Text;       // the whole fact, message or change
};

// Every fact, file name, message and change of the event that contains the text, in this order.
// The case of the letters A to Z does not count.
std::vector<Hit> FindInEvent(const Event& event, std::string_view text);
