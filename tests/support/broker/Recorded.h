// What the recording broker hands to a test: plain copies of CMPI values, paths and
// instances. They have no tie to the broker and outlive it.
#pragma once

#include <cmpidt.h>

#include <iosfwd>
#include <memory>
#include <string>
#include <vector>

namespace qelo::test {

struct Path;
struct Instance;
struct NamedValue;

// One typed value. Made by the broker from what a provider passed, and by a test with the
// named constructors below.
struct Value {
    // As the provider gave it: a text passed as CMPI_chars stays CMPI_chars here, although
    // a provider that reads it back gets a CMPI_string.
    CMPIType type = CMPI_null;
    bool isNull = true;

    // The value as text: texts and dates as they are, numbers in decimal, "true" or
    // "false", the toString() of a path, "{a,b}" for an array, "" for NULL.
    std::string text;

    // Whether an encapsulated value has its object.
    enum class Shape { Whole, Missing, WithoutHandle };
    Shape shape = Shape::Whole;

    // Scalars: the member that type names. All other bytes are 0.
    CMPIValue scalar = {0};
    // Arrays: the elements in order.
    std::vector<Value> elements;
    // CMPI_ref and CMPI_instance.
    std::shared_ptr<const Path> path;
    std::shared_ptr<const Instance> instance;

    Value() = default;
    // A CMPI_string; implicit, so that keys can be written as {{"Name", "alice"}}.
    Value(const char* value);
    Value(const std::string& value);

    static Value nullOf(CMPIType type);
    // What a sloppy broker hands out: a state that says good, and an object pointer that
    // is NULL, or an object whose handle is NULL. For CMPI_string, CMPI_dateTime,
    // CMPI_ref and CMPI_instance.
    static Value missing(CMPIType type);
    static Value withoutHandle(CMPIType type);
    static Value string(const std::string& value);
    static Value chars(const std::string& value);
    static Value boolean(bool value);
    static Value uint8(CMPIUint8 value);
    static Value uint16(CMPIUint16 value);
    static Value uint32(CMPIUint32 value);
    static Value uint64(CMPIUint64 value);
    static Value sint8(CMPISint8 value);
    static Value sint16(CMPISint16 value);
    static Value sint32(CMPISint32 value);
    static Value sint64(CMPISint64 value);
    static Value real32(CMPIReal32 value);
    static Value real64(CMPIReal64 value);
    // The 25 characters are taken as they are, also malformed ones.
    static Value dateTime(const std::string& text);
    static Value ref(const Path& path);
    static Value embedded(const Instance& instance);
    // elementType is without CMPI_ARRAY.
    static Value array(CMPIType elementType, const std::vector<Value>& elements);

    // Type and value in one line: uint32,1000 or chars,"alice" or string[],{"a","b"} or
    // dateTime,null. This is the form used in RecordingBroker::calls().
    std::string describe() const;

    // Same type, same text, both NULL or neither.
    friend bool operator==(const Value& a, const Value& b) {
        return a.type == b.type && a.isNull == b.isNull && a.shape == b.shape && a.text == b.text;
    }
    friend bool operator!=(const Value& a, const Value& b) { return !(a == b); }
};

struct NamedValue {
    std::string name;
    Value value;

    friend bool operator==(const NamedValue& a, const NamedValue& b) {
        return a.name == b.name && a.value == b.value;
    }
};

struct Path {
    std::string host;
    std::string nameSpace;
    std::string className;
    std::vector<NamedValue> keys; // in the order in which they were first added

    // The key of that name, ignoring case; NULL if there is none.
    const Value* key(const std::string& name) const;
    // The text of that key; "<none>" if there is none, "<null>" if it is NULL.
    std::string keyText(const std::string& name) const;
    std::vector<std::string> keyNames() const;
    // //host/namespace:Class.Key="text",Key2=5 with the parts that are there.
    std::string toString() const;
};

struct Instance {
    Path path;
    // In the order in which they were first set, without those that the filter hides.
    std::vector<NamedValue> properties;

    // The property of that name, ignoring case; NULL if there is none.
    const Value* property(const std::string& name) const;
    // The text of that property; "<none>" if there is none, "<null>" if it is NULL.
    std::string propertyText(const std::string& name) const;
    std::vector<std::string> propertyNames() const;
    // All properties as name=describe(), one a line.
    std::string toString() const;
};

// "uint32", "string[]" for CMPI_stringA, "0x1234" for what is no type.
std::string typeName(CMPIType type);

// GoogleTest prints these in failure messages.
std::ostream& operator<<(std::ostream& out, const Value& value);
std::ostream& operator<<(std::ostream& out, const NamedValue& value);
std::ostream& operator<<(std::ostream& out, const Path& path);
std::ostream& operator<<(std::ostream& out, const Instance& instance);

} // namespace qelo::test
