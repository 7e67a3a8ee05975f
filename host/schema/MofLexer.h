// The words of a MOF text.
#pragma once

#include "Mof.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace qelo::schema {

struct Position {
    std::size_t line = 1;
    std::size_t column = 1; // in bytes
};

enum class TokenKind : std::uint8_t {
    Name,      // keywords too
    String,    // `value` is the decoded text
    Character, // `value` is the decoded text: one character
    Integer,   // `magnitude` and `negative`
    Real,      // `text` is its decimal form
    Alias,     // "$name": `text` is the name
    Symbol,    // one character of []{}():;,=#
    End,
};

struct Token {
    TokenKind kind = TokenKind::End;
    std::string_view text; // as it stands in the source
    std::string value;
    std::uint64_t magnitude = 0;
    bool negative = false;
    Position position;
};

class MofLexer {
public:
    // The source must outlive the lexer and its tokens. Throws SchemaError, as next() does.
    explicit MofLexer(const MofSource& source);

    // The next token; at the end, End again and again.
    Token next();

    // The error "name:line:column: text".
    SchemaError error(const Position& position, const std::string& text) const;

private:
    bool atEnd() const { return offset_ >= text_.size(); }
    char current() const { return atEnd() ? '\0' : text_[offset_]; }
    char following() const { return offset_ + 1 < text_.size() ? text_[offset_ + 1] : '\0'; }
    void advance();
    void skipBlanks();
    void skipBlockComment();
    std::string_view word();
    void readName(Token& token);
    void readString(Token& token);
    void readCharacter(Token& token);
    void readNumber(Token& token);
    void readInteger(Token& token, std::string_view digits);
    void readAlias(Token& token);
    [[noreturn]] void fail(const Token& token, const std::string& text) const;

    const std::string& name_;
    std::string_view text_;
    std::size_t offset_ = 0;
    Position position_;
};

} // namespace qelo::schema
