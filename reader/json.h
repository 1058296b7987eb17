#pragma once

#include <string>
#include <string_view>

#include "reader/change.h"
#include "reader/finding.h"
#include "reader/history.h"

// The JSON objects, each on one line without a line feed at its end. The text is valid UTF-8
// whatever the arguments have. The source is the name of the archive or folder as on the command
// line.

// The facts of an event and the number of its changes.
std::string EventJson(std::string_view source, const Event& event);

// The same, with its command line, report, files, messages and changes.
std::string EventDetailsJson(std::string_view source, const Event& event);

// One change of an event: its kind, section, path, name and fields.
std::string ChangeJson(std::string_view source, const Event& event, const Change& change);

// The level, code, event and text of a finding.
std::string FindingJson(std::string_view source, const Finding& finding);

// Something in an event that contains the text searched for; the last three are those of a Hit.
std::string HitJson(std::string_view source, const Event& event, std::string_view kind,
                    std::string_view name, std::string_view text);
