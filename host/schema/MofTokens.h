// A MOF text as a parser reads it: token by token, one of them looked at ahead.
#pragma once

#include "MofValues.h"

namespace qelo::schema {

class MofTokens {
public:
    explicit MofTokens(const MofSource& source) : lexer_(source), current_(lexer_.next()) {}

    const Token& peek() const { return current_; }
    Token take();

    bool atSymbol(char symbol) const {
        return current_.kind == TokenKind::Symbol && current_.text[0] == symbol;
    }
    bool atKeyword(std::string_view keyword) const { return isKeyword(current_, keyword); }

    // Takes the token if it is that one.
    bool skipSymbol(char symbol);
    bool skipKeyword(std::string_view keyword);

    void expectSymbol(char symbol);
    void expectKeyword(std::string_view keyword);
    // `what` says what the name is for: "the name of a class".
    std::string expectName(const char* what);

    // "[n]" or "[]" if it stands here: whether it does, and the size.
    bool skipArrayBrackets(std::optional<std::uint32_t>& size);

    // A literal, or literals in braces.
    Initializer initializer();

    [[noreturn]] void fail(const Position& position, const std::string& text) const {
        throw lexer_.error(position, text);
    }
    [[noreturn]] void failHere(const std::string& text) const { fail(current_.position, text); }

private:
    Token literal();

    MofLexer lexer_;
    Token current_;
};

} // namespace qelo::schema
