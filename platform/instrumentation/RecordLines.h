// Keeps track of the lines of an account file while the C library reads its records, so that
// every line that it passes over is known by number and reason.
#pragma once

#include "Damage.h"

#include <cstddef>
#include <string_view>

namespace qelo::nodes {

class RecordLines {
public:
    // `fields` is the number of fields of a complete line. `text` and `damage` have to
    // outlive this object.
    RecordLines(std::string_view text, std::size_t fields, Damage& damage)
        : text_(text), fields_(fields), damage_(damage) {}

    // The reader has given a record whose line ends before offset `end`. Reports the lines
    // passed over before it, and flaws of its own line. Returns the number of its line.
    std::size_t recordEndsAt(std::size_t end);

    // The reader is done: what is left was passed over.
    void finish();

    // Reports the record's line last returned by recordEndsAt.
    void report(std::string_view reason) { damage_.add(number_, reason); }

    // The line that starts at an offset, without its line end.
    std::string_view lineAt(std::size_t begin) const;

private:
    std::string_view takeLine();
    void reportSkipped(std::string_view line);

    std::string_view text_;
    std::size_t fields_;
    Damage& damage_;
    std::size_t at_ = 0;
    std::size_t number_ = 0;
};

} // namespace qelo::nodes
