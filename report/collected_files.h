#pragma once

#include <span>

#include "app/install_event.h"

// CInstallEvent::CollectFiles for each of the events, with one change of the history file for all
// of their keys: a change costs as much as the file is long, however little is changed.
void CollectFiles(std::span<CInstallEvent> events);
