#pragma once

#include <string_view>

#include "platform/posix/registry_names.h"
#include "platform/registry.h"

// The values of one key, and the lines that say them.

using RegistryValues = RegistryNames<RegistryData>;

// How an export writes text in hexadecimal form: "REGEDIT4" in the narrow bytes of its code page,
// its follower in UTF-16.
enum class HexText { kNarrow, kUtf16 };

// Reads the lines below a key's heading, as UTF-8, into the key's values: a value that is there
// already is replaced or, by "name"=-, removed. A line that cannot be read changes nothing, and
// the line behind it counts again. A line that begins with a bracket ends the reading: it is a
// heading that cannot be read, and no one knows which key the lines behind it are for.
void ReadValueLines(std::string_view lines, HexText hexText, RegistryValues& values);
