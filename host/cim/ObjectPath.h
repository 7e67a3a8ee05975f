// A CIM object path: where an object is (host, namespace), of which class, and which one
// (keys). Without keys it names a class. Names compare ignoring case, values exactly.
#pragma once

#include "Value.h"

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace qelo::cim {

// Equality of CIM names (classes, properties, keys): ASCII letters compare ignoring case.
bool sameName(std::string_view left, std::string_view right);

class ObjectPath {
public:
    struct Key {
        std::string name;
        Value value;
    };

    ObjectPath() = default;
    ObjectPath(std::string nameSpace, std::string className)
        : nameSpace_(std::move(nameSpace)), className_(std::move(className)) {}

    const std::string& host() const { return host_; }
    const std::string& nameSpace() const { return nameSpace_; }
    const std::string& className() const { return className_; }
    const std::vector<Key>& keys() const { return keys_; }

    void setHost(std::string host) { host_ = std::move(host); }
    void setNameSpace(std::string nameSpace) { nameSpace_ = std::move(nameSpace); }
    void setClassName(std::string className) { className_ = std::move(className); }
    void setKey(std::string_view name, Value value); // adds, or replaces under the same name
    void clearKeys() { keys_.clear(); }
    void reserveKeys(std::size_t count) { keys_.reserve(count); }

    // For whoever fills the same path again and again; what it had keeps its memory. No two names
    // of keys may be the same.
    void assignNames(std::string_view host, std::string_view nameSpace,
                     std::string_view className) {
        host_.assign(host);
        nameSpace_.assign(nameSpace);
        className_.assign(className);
    }
    std::vector<Key>& mutableKeys() { return keys_; }

    // The key of that name, or null.
    const Value* key(std::string_view name) const;

    // The canonical text, as clients such as wbemcli print and read it:
    //   [//host/][namespace:]Class.Key1="text",Key2=5,Key3=true
    // Texts and datetimes stand in double quotes with \" and \\ escaped, and with control
    // characters as MOF writes them (\n, \x001B); a reference is the quoted text of its path.
    // Keys keep their order. A key without a value is written NULL, which parse() refuses.
    std::string toText(bool withHost = false, bool withNameSpace = true) const;

    // Reads such a text. On failure: nothing, and `error` says what is wrong and where.
    // Unquoted values are integers (uint64, negative ones sint64) or booleans; quoted ones
    // are strings. A key value that is itself quoted text of a path stays a string here: only
    // a schema can tell. Names consist of ASCII letters, digits and "_"; a key may be given
    // once; blanks are not skipped; more than 64 keys are refused.
    static std::optional<ObjectPath> parse(std::string_view text, std::string& error);

private:
    std::string host_;
    std::string nameSpace_;
    std::string className_;
    std::vector<Key> keys_;
};

// Same class and same keys with equal values, in any order. Host and namespace do not count.
bool operator==(const ObjectPath& left, const ObjectPath& right);
inline bool operator!=(const ObjectPath& left, const ObjectPath& right) { return !(left == right); }

} // namespace qelo::cim
