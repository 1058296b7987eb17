#pragma once

#include <string>
#include <string_view>

// UTF-8 text made safe for HTML element content and for attribute values in double quotes.
//
// The five markup characters become entities. Control characters, and the marks that change the
// direction of text or are invisible, are shown by their number, such as "[U+202E]", so that a
// hostile name can neither hide nor reorder what surrounds it.
std::string EscapeHtml(std::string_view text);
