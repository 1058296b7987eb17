#pragma once

#include <string>
#include <vector>

#include "app/install_event.h"

// The events of one product copy, in the order of their sections. The records contain no values:
// they are read from the history file when the event is printed.
struct CCopyEvents {
  std::string Name;  // of the copy, or the identity of an event without one
  std::vector<CInstallEvent> Events;
};
