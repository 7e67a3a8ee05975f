#include "RecordLines.h"

#include <algorithm>

namespace qelo::nodes {

namespace {

std::size_t fieldsIn(std::string_view line) {
    return 1 + static_cast<std::size_t>(std::count(line.begin(), line.end(), ':'));
}

// What the C library's readers pass over without it being an error.
bool isEmptyOrComment(std::string_view line) {
    const auto begin = line.find_first_not_of(" \t\r\v\f");
    return begin == std::string_view::npos || line[begin] == '#';
}

bool holdsNul(std::string_view line) { return line.find('\0') != std::string_view::npos; }

} // namespace

std::string_view RecordLines::lineAt(std::size_t begin) const {
    return text_.substr(begin, text_.find('\n', begin) - begin);
}

std::string_view RecordLines::takeLine() {
    const std::string_view line = lineAt(at_);
    at_ = std::min(at_ + line.size() + 1, text_.size());
    ++number_;
    return line;
}

void RecordLines::reportSkipped(std::string_view line) {
    if (isEmptyOrComment(line)) {
        return;
    }
    if (holdsNul(line)) {
        report("NUL byte");
    } else if (fieldsIn(line) < fields_) {
        report("too few fields");
    } else {
        report("malformed number or field");
    }
}

std::size_t RecordLines::recordEndsAt(std::size_t end) {
    std::string_view line;
    for (line = takeLine(); at_ < end; line = takeLine()) {
        reportSkipped(line);
    }
    if (holdsNul(line)) {
        report("NUL byte, read up to it");
    } else if (fieldsIn(line) < fields_) {
        report("too few fields, the missing ones taken as empty");
    } else if (fieldsIn(line) > fields_) {
        report("too many fields");
    }
    return number_;
}

void RecordLines::finish() {
    while (at_ < text_.size()) {
        reportSkipped(takeLine());
    }
}

} // namespace qelo::nodes
