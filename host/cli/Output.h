// Where results go. The commands know this class only, so a test can look over their
// shoulder and a full disk is noticed in one place.
#pragma once

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>

namespace qelo::cli {

// The output cannot be written. what() names the reason in the words of the system.
class OutputError : public std::runtime_error {
public:
    explicit OutputError(int error);
    // Whether the reader has gone, as in "qelosim ei X | head -1".
    bool readerHasGone() const;

private:
    int error_;
};

class Output {
public:
    virtual ~Output() = default;

    // Takes the text; it may stay in a buffer until flush(). Both throw OutputError.
    virtual void write(std::string_view text) = 0;
    virtual void flush() = 0;

    // The width of the terminal in columns; 0 when the output is none.
    virtual std::size_t columns() const = 0;
    // Whether escape sequences for colours are welcome.
    virtual bool hasColours() const = 0;
};

// An open file descriptor, which stays the caller's. What has not been flushed when the
// object is destroyed is lost.
class FileOutput final : public Output {
public:
    explicit FileOutput(int descriptor);

    void write(std::string_view text) override;
    void flush() override;
    std::size_t columns() const override { return columns_; }
    bool hasColours() const override { return colours_; }

private:
    int descriptor_;
    std::size_t columns_ = 0;
    bool colours_ = false;
    std::string buffer_;
};

} // namespace qelo::cli
