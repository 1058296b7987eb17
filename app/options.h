#pragma once

#include <span>
#include <string>
#include <string_view>

class CInstallEvent;

// An option of the command line, which takes one value. The three whose field is the event's
// identity are the event kinds.
struct Option {
  std::string_view Word;
  std::string CInstallEvent::*Field;
  std::string_view Value;  // what the value is, in one word, for the help
  std::string_view Help;
};

// All options, in the order in which an argument is compared with them.
std::span<const Option> Options();

// The option of that word, whatever its case, or null.
const Option* FindOption(std::string_view argument);
