// Texts on their way to clients, logs and node paths: what comes out is valid, bounded, and
// tells what went in.
#include "FuzzInput.h"

#include <Text.h>
#include <cim/Utf8.h>
#include <common/Utf8.h>
#include <logging/LineFormat.h>

#include <algorithm>

namespace {

using namespace qelo;
using fuzz::require;

// Two independent readers of UTF-8 agree.
void checkReaders(std::string_view text) {
    const bool valid = cim::isValidUtf8(text);
    require(nodes::isValidUtf8(text) == valid);
    std::string again;
    for (std::size_t at = 0; at < text.size();) {
        const auto character = cim::decodeUtf8(text, at);
        const std::size_t begin = at;
        const char32_t other = platform::nextCodePoint(text, at);
        require(at > begin && at <= text.size());
        require(other == (character ? character->code : platform::kInvalidCodePoint));
        require(!character || at - begin == character->length);
        cim::appendUtf8(again, other);
    }
    require(nodes::validUtf8(text) == again);
    require(valid == (again == text));
}

bool hasControl(std::string_view text) {
    return std::any_of(text.begin(), text.end(),
                       [](char c) { return static_cast<unsigned char>(c) < 0x20 || c == 0x7f; });
}

void checkPrintable(std::string_view text) {
    const std::string shown = nodes::printable(text);
    require(cim::isValidUtf8(shown) && !hasControl(shown));
    require(!fuzz::contains(shown, "\xE2\x80\xA8") && !fuzz::contains(shown, "\xE2\x80\xA9"));
    require(nodes::printable(shown) == shown);
}

int hexDigit(char c) { return c <= '9' ? c - '0' : c - 'A' + 10; }

// A step of a path can be taken back.
void checkPathStep(std::string_view text) {
    const std::string step = nodes::pathStep(text);
    std::string back;
    for (std::size_t i = 0; i < step.size(); ++i) {
        require(step[i] != '/' && !hasControl(step.substr(i, 1)));
        const bool escaped = step[i] == '%';
        back += escaped
                    ? static_cast<char>(hexDigit(step.at(i + 1)) * 16 + hexDigit(step.at(i + 2)))
                    : step[i];
        i += escaped ? 2 : 0;
    }
    require(back == text);
}

void checkLogLine(std::string_view text) {
    const std::size_t limit = text.empty() ? 0 : static_cast<unsigned char>(text[0]) * 4U;
    for (const logging::Blanks blanks : {logging::Blanks::Kept, logging::Blanks::Escaped}) {
        std::string out = "> ";
        logging::appendEscaped(out, text, limit, blanks);
        require(out.size() <= 2 + limit + 3 && out.compare(0, 2, "> ") == 0);
        require(cim::isValidUtf8(out) && !hasControl(out));
        require(blanks == logging::Blanks::Kept || out.find(' ', 2) == std::string::npos);
        require(!fuzz::contains(out, "\xE2\x80\xAE"));
    }
    const std::string component(text.substr(0, text.size() / 2));
    const logging::Line line{component.c_str(), component.c_str(), 1, component, 6000, text};
    const std::string whole = logging::formatLine(line);
    require(!hasControl(whole) && cim::isValidUtf8(whole) && whole.size() < 34UL * 1024);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = fuzz::viewOf(data, size);
    checkReaders(text);
    checkPrintable(text);
    checkPathStep(text);
    checkLogLine(text);
    return 0;
}
