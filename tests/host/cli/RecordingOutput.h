// An output that keeps what is written, and that can be a terminal or fail on demand.
#pragma once

#include <cli/Output.h>

#include <string>

namespace qelo::cli {

class RecordingOutput final : public Output {
public:
    void write(std::string_view text) override {
        if (text_.size() + text.size() > capacity_) {
            throw OutputError(error_);
        }
        text_ += text;
    }
    void flush() override { ++flushes_; }
    std::size_t columns() const override { return columns_; }
    bool hasColours() const override { return colours_; }

    const std::string& text() const { return text_; }
    int flushes() const { return flushes_; }
    void becomeTerminal(std::size_t columns, bool colours = false) {
        columns_ = columns;
        colours_ = colours;
    }
    // Takes this many bytes and then fails with `error`.
    void failBehind(std::size_t capacity, int error) {
        capacity_ = capacity;
        error_ = error;
    }

private:
    std::string text_;
    std::size_t columns_ = 0;
    bool colours_ = false;
    int flushes_ = 0;
    std::size_t capacity_ = std::string::npos;
    int error_ = 0;
};

} // namespace qelo::cli
