#include "MofTokens.h"

#include <utility>

namespace qelo::schema {
namespace {

constexpr std::size_t kMostElements = 65536;

std::string described(const Token& token) {
    switch (token.kind) {
    case TokenKind::End:
        return "the end of the text";
    case TokenKind::String:
        return "a string";
    case TokenKind::Character:
        return "a character";
    default:
        return "\"" + std::string(token.text) + "\"";
    }
}

} // namespace

Token MofTokens::take() { return std::exchange(current_, lexer_.next()); }

bool MofTokens::skipSymbol(char symbol) {
    const bool there = atSymbol(symbol);
    if (there) {
        take();
    }
    return there;
}

bool MofTokens::skipKeyword(std::string_view keyword) {
    const bool there = atKeyword(keyword);
    if (there) {
        take();
    }
    return there;
}

void MofTokens::expectSymbol(char symbol) {
    if (!skipSymbol(symbol)) {
        failHere(std::string("\"") + symbol + "\" is expected, not " + described(current_));
    }
}

void MofTokens::expectKeyword(std::string_view keyword) {
    if (!skipKeyword(keyword)) {
        failHere("\"" + std::string(keyword) + "\" is expected, not " + described(current_));
    }
}

std::string MofTokens::expectName(const char* what) {
    if (current_.kind != TokenKind::Name) {
        failHere(std::string(what) + " is expected, not " + described(current_));
    }
    return std::string(take().text);
}

bool MofTokens::skipArrayBrackets(std::optional<std::uint32_t>& size) {
    if (!skipSymbol('[')) {
        return false;
    }
    if (current_.kind == TokenKind::Integer) {
        if (current_.negative || current_.magnitude == 0 || current_.magnitude > kMostElements) {
            failHere("not a size of an array");
        }
        size = static_cast<std::uint32_t>(take().magnitude);
    }
    expectSymbol(']');
    return true;
}

Token MofTokens::literal() {
    switch (current_.kind) {
    case TokenKind::Symbol:
    case TokenKind::End:
        failHere("a value is expected, not " + described(current_));
    default:
        break;
    }
    Token first = take();
    while (first.kind == TokenKind::String && current_.kind == TokenKind::String) {
        first.value += take().value;
    }
    return first;
}

Initializer MofTokens::initializer() {
    Initializer result;
    result.position = current_.position;
    result.array = skipSymbol('{');
    if (!result.array) {
        result.literals.push_back(literal());
        return result;
    }
    if (skipSymbol('}')) {
        return result;
    }
    do {
        if (result.literals.size() == kMostElements) {
            failHere("too many elements");
        }
        result.literals.push_back(literal());
    } while (skipSymbol(','));
    expectSymbol('}');
    return result;
}

} // namespace qelo::schema
