// Texts as a terminal may show them. Account data comes from anybody who may edit a full
// name, so nothing of it reaches a terminal unseen.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace qelo::cli {

// Whether a character can be shown as it is: it takes its place on the line and changes
// nothing around it. Control and format characters (direction overrides, joiners), line
// separators, private and unassigned characters cannot.
bool isDisplayable(char32_t code);

// Whether the text is well-formed UTF-8 of displayable characters only.
bool isDisplayable(std::string_view text);

// The text with everything else escaped: characters as \n, \t, \x001B or \U000E0001, bytes
// that are not UTF-8 as \xFF. A backslash stays as it is.
std::string displayText(std::string_view raw);

// The columns that a displayable text takes on a terminal: wide characters take two,
// combining ones none.
std::size_t displayWidth(std::string_view text);

// The text, or as much of its beginning as fits into `width` columns with a "…" behind it.
std::string clippedTo(std::string_view text, std::size_t width);

} // namespace qelo::cli
