#pragma once

#include <cstddef>

#include "reader/event_section.h"
#include "reader/history.h"
#include "reader/report.h"

// What is known of an event, as UTF-8, from the history file or from its report.

// The facts of a section. Of its report and its files only the names are known then.
Event EventOfSection(const EventSection& section, const TextDecoder& decoder);

// Adds what the report says of a run: the computer's name, and for a run without a section of its
// own everything else.
void AddFactsOfRun(const ReportRun& run, const TextDecoder& decoder, Event& event);

// The bytes of all its texts but the messages and changes.
size_t BytesOfFacts(const Event& event);
