#include "ObjectPath.h"

#include "QuotedText.h"

#include <algorithm>

namespace qelo::cim {
namespace {

char toLower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

template <typename Keys> auto findKey(Keys& keys, std::string_view name) {
    return std::find_if(keys.begin(), keys.end(),
                        [&](const ObjectPath::Key& key) { return sameName(key.name, name); });
}

bool isWrittenBare(const Value& value) {
    switch (value.type()) {
    case Type::Char16:
    case Type::String:
    case Type::DateTime:
    case Type::Reference:
    case Type::Instance:
        return false;
    default:
        return !value.isArray();
    }
}

void appendKeyValue(std::string& text, const Value& value) {
    if (value.isNull()) {
        text += "NULL";
    } else if (isWrittenBare(value)) {
        text += value.toText();
    } else {
        appendQuoted(text, value.toText());
    }
}

} // namespace

bool sameName(std::string_view left, std::string_view right) {
    // Nearly always they are spelled alike.
    return left.size() == right.size() &&
           (left == right || std::equal(left.begin(), left.end(), right.begin(),
                                        [](char a, char b) { return toLower(a) == toLower(b); }));
}

void ObjectPath::setKey(std::string_view name, Value value) {
    const auto found = findKey(keys_, name);
    if (found != keys_.end()) {
        found->value = std::move(value);
    } else {
        keys_.push_back({std::string(name), std::move(value)});
    }
}

const Value* ObjectPath::key(std::string_view name) const {
    const auto found = findKey(keys_, name);
    return found == keys_.end() ? nullptr : &found->value;
}

std::string ObjectPath::toText(bool withHost, bool withNameSpace) const {
    std::string text;
    if (withHost && !host_.empty()) {
        text += "//" + host_ + "/";
    }
    if (withNameSpace && !nameSpace_.empty()) {
        text += nameSpace_ + ":";
    }
    text += className_;
    char separator = '.';
    for (const Key& key : keys_) {
        text += separator + key.name + "=";
        appendKeyValue(text, key.value);
        separator = ',';
    }
    return text;
}

bool operator==(const ObjectPath& left, const ObjectPath& right) {
    if (!sameName(left.className(), right.className()) ||
        left.keys().size() != right.keys().size()) {
        return false;
    }
    return std::all_of(left.keys().begin(), left.keys().end(), [&](const ObjectPath::Key& key) {
        const Value* other = right.key(key.name);
        return other != nullptr && *other == key.value;
    });
}

} // namespace qelo::cim
