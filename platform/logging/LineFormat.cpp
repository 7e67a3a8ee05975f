#include "logging/LineFormat.h"

#include "common/Utf8.h"
#include "logging/ProcessIds.h"

#include <fmt/format.h>

#include <iterator>

namespace qelo::logging {
namespace {

using platform::isControl;
using platform::kInvalidCodePoint;
using platform::nextCodePoint;

constexpr std::size_t kLongestName = 256;
constexpr std::size_t kLongestMessage = std::size_t{32} * 1024;
constexpr std::string_view kCutMark = "...";

// Characters that end a line or turn the text around where the line is shown.
bool misleads(char32_t character) {
    return isControl(character) || character == 0x061C || character == 0x200E ||
           character == 0x200F || (character >= 0x2028 && character <= 0x202E) ||
           (character >= 0x2066 && character <= 0x2069);
}

bool isPlain(char character, Blanks blanks) {
    return (character > ' ' && character < 0x7F && character != '\\') ||
           (character == ' ' && blanks == Blanks::Kept);
}

std::size_t plainRun(std::string_view text, std::size_t offset, Blanks blanks) {
    std::size_t end = offset;
    while (end < text.size() && isPlain(text[end], blanks)) {
        ++end;
    }
    return end - offset;
}

std::string hexBytes(std::string_view bytes) {
    std::string escaped;
    for (const char byte : bytes) {
        fmt::format_to(std::back_inserter(escaped), "\\x{:02x}", static_cast<unsigned char>(byte));
    }
    return escaped;
}

// `bytes` is the encoding of `character`, or bytes that encode nothing.
std::string escapeOf(char32_t character, std::string_view bytes) {
    switch (character) {
    case U'\n':
        return "\\n";
    case U'\r':
        return "\\r";
    case U'\t':
        return "\\t";
    case U'\\':
        return "\\\\";
    default:
        break;
    }
    if (character == kInvalidCodePoint || character < 0x80) {
        return hexBytes(bytes);
    }
    return fmt::format("\\u{{{:04x}}}", static_cast<unsigned int>(character));
}

// The form in which the character at `offset` appears; moves `offset` past it.
std::string shownForm(std::string_view text, std::size_t& offset) {
    const std::size_t start = offset;
    const char32_t character = nextCodePoint(text, offset);
    const std::string_view bytes = text.substr(start, offset - start);
    const bool shownAsIs =
        character >= 0x80 && character != kInvalidCodePoint && !misleads(character);
    return shownAsIs ? std::string(bytes) : escapeOf(character, bytes);
}

std::string_view viewOf(const char* text) { return text == nullptr ? "-" : text; }

void appendName(std::string& out, std::string_view name) {
    appendEscaped(out, name.empty() ? "-" : name, kLongestName, Blanks::Escaped);
}

} // namespace

void appendEscaped(std::string& out, std::string_view text, std::size_t limit, Blanks blanks) {
    const std::size_t most = out.size() + limit;
    for (std::size_t offset = 0; offset < text.size();) {
        const std::size_t run = plainRun(text, offset, blanks);
        const std::string shown = run > 0 ? std::string() : shownForm(text, offset);
        const std::string_view piece = run > 0 ? text.substr(offset, run) : shown;
        offset += run;
        const std::size_t room = most - out.size();
        if (piece.size() > room) {
            // A run may be cut anywhere, an escape or a character of several bytes nowhere.
            out += run > 0 ? piece.substr(0, room) : std::string_view();
            out += kCutMark;
            return;
        }
        out += piece;
    }
}

std::string formatLine(const Line& line) {
    std::string text;
    text.reserve(line.message.size() + 160);
    const ProcessIds ids = processIds();
    fmt::format_to(std::back_inserter(text), FMT_STRING("[{}:{}] {} "), ids.process, ids.thread,
                   line.level);
    appendName(text, line.component);
    text += ' ';
    appendName(text, viewOf(line.function));
    text += "() ";
    appendName(text, viewOf(line.file));
    fmt::format_to(std::back_inserter(text), FMT_STRING(":{} "), line.number);
    appendEscaped(text, line.message, kLongestMessage, Blanks::Kept);
    return text;
}

} // namespace qelo::logging
