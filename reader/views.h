#pragma once

#include <string>
#include <vector>

#include "reader/finding.h"
#include "reader/history.h"
#include "reader/terminal_text.h"

// The texts that the commands print, in UTF-8. They contain no character of the history that a
// terminal could obey (Printable).

// A line for each of the events, in columns as wide as their contents up to kWidestColumn
// (reader/limits.h), or cut to the terminal's width; then a line that counts them.
std::string ListText(const std::vector<const Event*>& events, const ViewOptions& options);

// The facts, messages, files and changes of an event.
std::string ShowText(const Event& event, const ViewOptions& options);

// What differs between the snapshots of an event, what does not and what cannot be compared; then
// its messages and files.
std::string ChangesText(const Event& event, const ViewOptions& options);

// The same without title, messages and files.
std::string DifferencesText(const Event& event, const ViewOptions& options);

// The messages, or the installer's files, below a heading; empty if there are none.
std::string MessagesText(const Event& event);
std::string FilesText(const Event& event);

// A line for each finding, and one that counts them.
std::string FindingsText(const FindingList& findings, const ViewOptions& options);
