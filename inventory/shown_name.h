#pragma once

#include <string>

// A name that comes from the system (of a process, user, group or service), as the report shows it:
// with "?" for each control character, so that it cannot add a line or send a terminal an escape
// sequence. Control characters are the bytes 0x00 to 0x1F and 0x7F, and 0xC2 with 0x80 to 0x9F,
// which is one in UTF-8. Alone, or in a two-byte character of the system's code page, these last
// are letters, and stay.
std::string ShownName(const std::string& name);
