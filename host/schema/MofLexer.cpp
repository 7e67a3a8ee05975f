#include "MofLexer.h"

#include <cim/QuotedText.h>
#include <cim/Utf8.h>

#include <charconv>

namespace qelo::schema {
namespace {

constexpr std::size_t kLongestName = 256;
constexpr std::string_view kSymbols = "[]{}():;,=#";

bool isDigit(char c) { return c >= '0' && c <= '9'; }
bool isNameStart(char c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '_'; }
bool isNamePart(char c) { return isNameStart(c) || isDigit(c); }
bool isBlank(char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n' || c == '\f'; }

// The number system of an integer, and its digits without the mark of the system.
int baseOf(std::string_view& digits) {
    if (digits.size() > 2 && digits[0] == '0' && (digits[1] == 'x' || digits[1] == 'X')) {
        digits.remove_prefix(2);
        return 16;
    }
    if (digits.size() > 1 && (digits.back() == 'b' || digits.back() == 'B')) {
        digits.remove_suffix(1);
        return 2;
    }
    if (digits.size() > 1 && digits[0] == '0') {
        digits.remove_prefix(1);
        return 8;
    }
    return 10;
}

} // namespace

MofLexer::MofLexer(const MofSource& source) : name_(source.name), text_(source.text) {
    constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";
    if (text_.substr(0, byteOrderMark.size()) == byteOrderMark) {
        text_.remove_prefix(byteOrderMark.size());
    }
    if (!cim::isValidUtf8(text_)) {
        throw SchemaError(name_ + ": the text is not UTF-8");
    }
}

SchemaError MofLexer::error(const Position& position, const std::string& text) const {
    return SchemaError(name_ + ":" + std::to_string(position.line) + ":" +
                       std::to_string(position.column) + ": " + text);
}

void MofLexer::fail(const Token& token, const std::string& text) const {
    throw error(token.position, text);
}

void MofLexer::advance() {
    if (text_[offset_] == '\n') {
        ++position_.line;
        position_.column = 1;
    } else {
        ++position_.column;
    }
    ++offset_;
}

void MofLexer::skipBlockComment() {
    const Position start = position_;
    advance();
    advance();
    while (!atEnd()) {
        if (current() == '*' && following() == '/') {
            advance();
            advance();
            return;
        }
        advance();
    }
    throw error(start, "the comment is not closed");
}

void MofLexer::skipBlanks() {
    while (!atEnd()) {
        if (isBlank(current())) {
            advance();
        } else if (current() == '/' && following() == '/') {
            while (!atEnd() && current() != '\n') {
                advance();
            }
        } else if (current() == '/' && following() == '*') {
            skipBlockComment();
        } else {
            return;
        }
    }
}

std::string_view MofLexer::word() {
    const std::size_t start = offset_;
    while (!atEnd() && isNamePart(current())) {
        advance();
    }
    return text_.substr(start, offset_ - start);
}

void MofLexer::readName(Token& token) {
    token.kind = TokenKind::Name;
    token.text = word();
    if (token.text.size() > kLongestName) {
        fail(token, "the name is too long");
    }
}

void MofLexer::readAlias(Token& token) {
    advance();
    token.kind = TokenKind::Alias;
    token.text = word();
    if (token.text.empty()) {
        fail(token, "a name is expected behind $");
    }
}

void MofLexer::readString(Token& token) {
    token.kind = TokenKind::String;
    std::size_t end = offset_;
    std::string problem;
    // A string that is never closed is told at its own line, not at the end of the text.
    const std::string_view line = text_.substr(0, text_.find('\n', offset_));
    auto decoded = cim::readQuoted(line, end, problem);
    if (!decoded) {
        position_.column += end - offset_;
        throw error(position_, problem);
    }
    token.value = std::move(*decoded);
    position_.column += end - offset_;
    offset_ = end;
}

void MofLexer::readCharacter(Token& token) {
    constexpr std::size_t longestEscape = 6;
    token.kind = TokenKind::Character;
    const std::size_t start = offset_ + 1;
    const std::size_t searchFrom = start + (following() == '\\' ? 2 : 1);
    const std::size_t end = text_.find('\'', searchFrom);
    if (end == std::string_view::npos || end - start > longestEscape) {
        fail(token, "a single character and a closing ' are expected");
    }
    const std::string_view inner = text_.substr(start, end - start);
    if (inner == "\"") {
        token.value = inner;
    } else {
        const std::string quoted = "\"" + std::string(inner) + "\"";
        std::size_t position = 0;
        std::string problem;
        auto decoded = cim::readQuoted(quoted, position, problem);
        if (!decoded || position != quoted.size() || inner.find('\n') != inner.npos) {
            fail(token, problem.empty() ? "a single character is expected" : problem);
        }
        token.value = std::move(*decoded);
    }
    position_.column += end + 1 - offset_;
    offset_ = end + 1;
}

void MofLexer::readInteger(Token& token, std::string_view digits) {
    token.kind = TokenKind::Integer;
    const int base = baseOf(digits);
    const char* const end = digits.data() + digits.size();
    const auto [stop, problem] = std::from_chars(digits.data(), end, token.magnitude, base);
    if (problem == std::errc::result_out_of_range) {
        fail(token, "the number is too large");
    }
    if (problem != std::errc() || stop != end) {
        fail(token, "not a number: " + std::string(token.text));
    }
}

void MofLexer::readNumber(Token& token) {
    const std::size_t start = offset_;
    if (current() == '+' || current() == '-') {
        token.negative = current() == '-';
        advance();
    }
    const std::size_t digits = offset_;
    word();
    bool real = false;
    if (current() == '.') {
        real = true;
        advance();
        if (!isDigit(current())) {
            fail(token, "a digit is expected behind the point");
        }
        const std::string_view fraction = word();
        const bool exponent =
            !fraction.empty() && (fraction.back() == 'e' || fraction.back() == 'E');
        if (exponent && (current() == '+' || current() == '-')) {
            advance();
            word();
        }
    }
    token.text = text_.substr(start, offset_ - start);
    if (real) {
        token.kind = TokenKind::Real;
    } else {
        readInteger(token, text_.substr(digits, offset_ - digits));
    }
}

Token MofLexer::next() {
    skipBlanks();
    Token token;
    token.position = position_;
    if (atEnd()) {
        return token;
    }
    const char c = current();
    if (isNameStart(c)) {
        readName(token);
    } else if (c == '"') {
        readString(token);
    } else if (c == '\'') {
        readCharacter(token);
    } else if (isDigit(c) || c == '+' || c == '-' || c == '.') {
        readNumber(token);
    } else if (c == '$') {
        readAlias(token);
    } else if (kSymbols.find(c) != std::string_view::npos) {
        token.kind = TokenKind::Symbol;
        token.text = text_.substr(offset_, 1);
        advance();
    } else {
        fail(token, "an unexpected character");
    }
    return token;
}

} // namespace qelo::schema
