// The text of one line, made so that nothing in it can pass for another line or field.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace qelo::logging {

struct Line {
    const char* function; // may be null
    const char* file;     // may be null
    int number;
    std::string_view component;
    int level;
    std::string_view message;
};

// The whole line but its time and its end:
//   [pid:tid] level component function() file:line message
// Names and message are escaped as below, blanks in names too, and cut at a bounded length.
std::string formatLine(const Line& line);

enum class Blanks { Kept, Escaped };

// Appends `text` to `out`, at most `limit` bytes and then "...". Written as \n, \r, \t, \\,
// \xNN or \u{NNNN} are the backslash, control characters, line separators, characters that
// reverse the reading direction, and bytes that are not UTF-8.
void appendEscaped(std::string& out, std::string_view text, std::size_t limit, Blanks blanks);

} // namespace qelo::logging
