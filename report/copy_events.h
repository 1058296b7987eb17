#pragma once

#include <string>
#include <vector>

#include "app/install_event.h"

// The events of one product copy, in the order of their sections. The records hold no values: what
// an event says is read from the history file when it is printed.
struct CCopyEvents {
  std::string Name;  // the copy's, or the identity of an event that has none
  std::vector<CInstallEvent> Events;
};
