#pragma once

#include <optional>
#include <string>
#include <vector>

#include "reader/finding.h"
#include "reader/source.h"

// Keeps those of the files in a folder or an archive that belong to a history, with their paths
// below its folder. That is the folder in which History.ini is, whatever the case of its name: the
// top one before all others, then one that is named ORXHistory, then the one least deep. Without
// that file it is the first folder ORXHistory, or the top, if there are reports of events.
//
// Returns the path of that folder with a '/' at its end, empty for the top; nothing if there is
// neither. A second history is a finding.
std::optional<std::string> KeepHistory(std::vector<SourceFile>& files, FindingList& findings);
