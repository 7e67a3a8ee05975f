// Short pieces of XML, put together before they are appended to a text: appending each alone
// takes longer than copying it. What was added is in the text after flush(), and whoever
// appends to the text directly has to flush first. Nothing here throws but std::bad_alloc.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

namespace qelo::cimxml {

class Pieces {
public:
    explicit Pieces(std::string& text) : text_(text) {}
    ~Pieces() { explicit_bzero(buffer_.data(), buffer_.size()); } // it may have held a password
    Pieces(const Pieces&) = delete;
    Pieces& operator=(const Pieces&) = delete;

    // As it is.
    void add(std::string_view piece) {
        if (piece.size() > buffer_.size() - used_) {
            flush();
            if (piece.size() > buffer_.size()) {
                text_.append(piece);
                return;
            }
        }
        std::memcpy(buffer_.data() + used_, piece.data(), piece.size());
        used_ += piece.size();
    }

    // As appendText() and appendAttributeText() write it.
    void addText(std::string_view text);
    void addAttributeText(std::string_view text);
    // name="text", with a blank in front.
    void addAttribute(std::string_view name, std::string_view text);
    void addNumber(std::uint64_t number);
    void addNumber(std::int64_t number);

    // The text, with all that was added.
    std::string& flush() {
        text_.append(buffer_.data(), used_);
        used_ = 0;
        return text_;
    }

private:
    std::string& text_;
    std::size_t used_ = 0;
    std::array<char, 1024> buffer_; // only what was added counts
};

} // namespace qelo::cimxml
