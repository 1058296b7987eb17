#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

// Text for a terminal. All texts are UTF-8.

// How the views print.
struct ViewOptions {
  std::optional<size_t> Width;  // of the terminal in columns; nothing if there is none
  bool HasColours = false;
  bool ShowsAll = false;  // nothing is folded
};

enum class Colour { kPlain, kRed, kGreen, kYellow, kMagenta, kBold };

// The text in the colour, if the options allow one.
std::string Painted(std::string_view text, Colour colour, const ViewOptions& options);

// The text with every character that a terminal could obey (control characters, those that change
// the direction of text) as "?", and each tab and line break as a blank.
std::string Printable(std::string_view text);

// The columns that a terminal needs for a printable text: two for an East Asian wide character,
// none for one that combines with the one before.
size_t ColumnsOf(std::string_view text);

// The text with blanks after it up to the width; one that is wider stays as it is.
std::string PaddedTo(std::string_view text, size_t columns);

// The text, or as much of it as the width allows with "…" after it.
std::string CutTo(std::string_view text, size_t columns);
