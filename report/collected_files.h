#pragma once

#include <span>

#include "app/install_event.h"

// CInstallEvent::CollectFiles for each of the events, with one replacement of the history file for
// all of their keys: its cost depends on the size of the file, not on what is changed.
void CollectFiles(std::span<CInstallEvent> events);
