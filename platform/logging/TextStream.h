// Text that is collected piece by piece, and a stream that appends to such text.
#pragma once

#include <fmt/format.h>

#include <cstddef>
#include <cstring>
#include <ostream>
#include <streambuf>
#include <string>

namespace qelo::logging {

// Holds what most lines need without an allocation; appending is cheaper than to a string.
using TextBuffer = fmt::basic_memory_buffer<char, 512>;

// As the buffer's own append(), which is a call of some length for a few characters.
inline void appendTo(TextBuffer& text, const char* characters, std::size_t count) {
    const std::size_t before = text.size();
    text.resize(before + count);
    std::memcpy(text.data() + before, characters, count);
}

inline std::string toString(const TextBuffer& text) { return {text.data(), text.size()}; }

class TextStreambuf : public std::streambuf {
public:
    explicit TextStreambuf(TextBuffer& text) : text_(text) {}

    const TextBuffer& text() const { return text_; }

protected:
    int_type overflow(int_type character) override {
        if (!traits_type::eq_int_type(character, traits_type::eof())) {
            text_.push_back(traits_type::to_char_type(character));
        }
        return traits_type::not_eof(character);
    }

    std::streamsize xsputn(const char* characters, std::streamsize count) override {
        appendTo(text_, characters, static_cast<std::size_t>(count));
        return count;
    }

private:
    TextBuffer& text_;
};

// `text` must outlive the stream.
class TextStream final : private TextStreambuf, public std::ostream {
public:
    explicit TextStream(TextBuffer& text)
        : TextStreambuf(text), std::ostream(static_cast<std::streambuf*>(this)) {}

    using TextStreambuf::text;
};

} // namespace qelo::logging
