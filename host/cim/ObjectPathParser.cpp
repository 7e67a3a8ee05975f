// Reading the printed form of an object path.
#include "ObjectPath.h"
#include "QuotedText.h"
#include "ValueParser.h"

#include <cstddef>

namespace qelo::cim {
namespace {

// Enough for every class of the CIM schema; keeps a hostile text from taking quadratic time.
constexpr std::size_t kMaxKeys = 64;

bool isLetter(char c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '_'; }
bool isNameCharacter(char c) { return isLetter(c) || (c >= '0' && c <= '9'); }
bool isNameSpaceCharacter(char c) { return isNameCharacter(c) || c == '-'; }
bool isHostCharacter(char c) {
    return isNameCharacter(c) || std::string_view("-.:[]%~").find(c) != std::string_view::npos;
}

class Parser {
public:
    Parser(std::string_view text, std::string& error) : text_(text), error_(error) {}

    std::optional<ObjectPath> parse() {
        ObjectPath path;
        if (!readHost(path) || !readNameSpace(path) || !readClassName(path) || !readKeys(path)) {
            return std::nullopt;
        }
        return path;
    }

private:
    bool atEnd() const { return position_ == text_.size(); }

    bool fail(const std::string& what) {
        error_ = what + " at character " + std::to_string(position_ + 1);
        return false;
    }

    bool skip(char expected) {
        if (atEnd() || text_[position_] != expected) {
            return false;
        }
        ++position_;
        return true;
    }

    // The longest run of characters of one kind, perhaps empty.
    template <typename Kind> std::string_view take(Kind kind) {
        const std::size_t start = position_;
        while (!atEnd() && kind(text_[position_])) {
            ++position_;
        }
        return text_.substr(start, position_ - start);
    }

    bool readHost(ObjectPath& path) {
        if (text_.substr(0, 2) != "//") {
            return true;
        }
        position_ = 2;
        const std::string_view host = take(isHostCharacter);
        if (host.empty() || !skip('/')) {
            return fail("\"//\" must be followed by a host name and \"/\": unexpected text");
        }
        path.setHost(std::string(host));
        return true;
    }

    // A namespace is known by the ":" behind it, which no class name or key name contains.
    bool readNameSpace(ObjectPath& path) {
        const std::string_view rest = text_.substr(position_);
        const std::size_t stop = rest.find_first_of(":=\"");
        if (stop == std::string_view::npos || rest[stop] != ':') {
            return true;
        }
        const std::size_t start = position_;
        do {
            if (take(isNameSpaceCharacter).empty()) {
                return fail("a namespace name is expected");
            }
        } while (skip('/'));
        path.setNameSpace(std::string(text_.substr(start, position_ - start)));
        return skip(':') || fail("unexpected character in the namespace");
    }

    bool readName(std::string& name, const char* what) {
        if (atEnd() || !isLetter(text_[position_])) {
            return fail(std::string("a ") + what + " is expected");
        }
        name = take(isNameCharacter);
        return true;
    }

    bool readClassName(ObjectPath& path) {
        std::string name;
        if (!readName(name, "class name")) {
            return false;
        }
        path.setClassName(std::move(name));
        return true;
    }

    bool readKeys(ObjectPath& path) {
        if (atEnd()) {
            return true;
        }
        if (!skip('.')) {
            return fail("unexpected character behind the class name");
        }
        do {
            if (!readKey(path)) {
                return false;
            }
        } while (skip(','));
        return atEnd() || fail("unexpected text behind a key value");
    }

    bool readKey(ObjectPath& path) {
        const std::size_t start = position_;
        std::string name;
        if (!readName(name, "key name")) {
            return false;
        }
        if (path.keys().size() == kMaxKeys || path.key(name) != nullptr) {
            position_ = start;
            return fail(path.key(name) != nullptr ? "a key is given twice" : "too many keys");
        }
        if (!skip('=')) {
            return fail("\"=\" is expected behind the key name");
        }
        auto value = readValue();
        if (!value) {
            return false;
        }
        path.setKey(name, *std::move(value));
        return true;
    }

    std::optional<Value> readValue() {
        std::string problem;
        if (!atEnd() && text_[position_] == '"') {
            auto text = readQuoted(text_, position_, problem);
            if (text) {
                return Value::string(*std::move(text));
            }
        } else {
            if (auto value = readBareValue(problem)) {
                return value;
            }
        }
        fail(problem);
        return std::nullopt;
    }

    std::optional<Value> readBareValue(std::string& problem) {
        const std::size_t start = position_;
        const std::string_view text = take([](char c) { return c != ','; });
        position_ = start;
        auto value = parseValue(Type::Boolean, text, problem);
        if (!value && !text.empty() && isLetter(text[0])) {
            problem = "a text must stand in double quotes: unexpected value";
            return std::nullopt;
        }
        if (!value) {
            const bool negative = !text.empty() && text[0] == '-';
            value = parseValue(negative ? Type::SInt64 : Type::UInt64, text, problem);
            // -0 is printed as 0, which has to read as the same key.
            if (negative && value && value->asSigned() == 0) {
                value = Value::unsignedInteger(Type::UInt64, 0);
            }
        }
        if (value) {
            position_ = start + text.size();
        }
        return value;
    }

    std::string_view text_;
    std::string& error_;
    std::size_t position_ = 0;
};

} // namespace

std::optional<ObjectPath> ObjectPath::parse(std::string_view text, std::string& error) {
    return Parser(text, error).parse();
}

} // namespace qelo::cim
