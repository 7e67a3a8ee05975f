// CIM values as the host keeps them: one value type for properties, keys, arguments and
// results, independent of any protocol. Values are ordinary copyable C++ values; a copy is
// deep as far as anybody can see (references and embedded instances are immutable once
// they are inside a value).
#pragma once

#include "DateTime.h"

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

namespace qelo::cim {

class ObjectPath;
class Instance;

// The intrinsic CIM types (DMTF DSP0004), references and embedded instances.
enum class Type : std::uint8_t {
    Boolean,
    Char16,
    UInt8,
    UInt16,
    UInt32,
    UInt64,
    SInt8,
    SInt16,
    SInt32,
    SInt64,
    Real32,
    Real64,
    String,
    DateTime,
    Reference,
    Instance,
};

// The name of a type as MOF and CIM-XML spell it: "uint16", "datetime", "reference" ...
const char* typeName(Type type);

// One value: a scalar, an array, or null. A null value still has a type and knows whether
// it stands for an array.
class Value {
public:
    using Array = std::vector<Value>;
    // Integers of every width are held in the two 64-bit alternatives; `type` tells the width.
    using Data = std::variant<std::monostate, bool, std::uint64_t, std::int64_t, double,
                              std::string, cim::DateTime, std::shared_ptr<const ObjectPath>,
                              std::shared_ptr<const Instance>, Array>;

    Value() = default; // a null string
    static Value null(Type type, bool array = false);
    // The four that take a type throw std::invalid_argument when the type is not of that
    // family or the value does not fit into it.
    static Value boolean(bool value);
    static Value unsignedInteger(Type type, std::uint64_t value); // Char16 and UInt*
    static Value signedInteger(Type type, std::int64_t value);    // SInt*
    static Value real(Type type, double value);                   // Real32 (rounded to it), Real64
    static Value string(std::string text);
    static Value dateTime(cim::DateTime value);
    static Value reference(ObjectPath path);
    static Value instance(Instance value);
    static Value array(Type type, Array elements); // scalars of that type, or nulls of it

    // Becomes a string. One that was a string keeps its memory: for whoever fills the same values
    // again and again.
    void setString(std::string_view text);

    Type type() const { return type_; }
    bool isArray() const { return array_; }
    bool isNull() const { return std::holds_alternative<std::monostate>(data_); }
    const Data& data() const { return data_; }

    // Each requires that the value holds that alternative (std::bad_variant_access otherwise).
    bool asBoolean() const { return std::get<bool>(data_); }
    std::uint64_t asUnsigned() const { return std::get<std::uint64_t>(data_); }
    std::int64_t asSigned() const { return std::get<std::int64_t>(data_); }
    double asReal() const { return std::get<double>(data_); }
    const std::string& asString() const { return std::get<std::string>(data_); }
    const cim::DateTime& asDateTime() const { return std::get<cim::DateTime>(data_); }
    const ObjectPath& asReference() const {
        return *std::get<std::shared_ptr<const ObjectPath>>(data_);
    }
    const Instance& asInstance() const { return *std::get<std::shared_ptr<const Instance>>(data_); }
    const Array& asArray() const { return std::get<Array>(data_); }

    // A scalar as plain text (string as it is, numbers in decimal, "true"/"false", datetime
    // in its 25 characters, a reference as its printed path, a char16 as its character in
    // UTF-8, an embedded instance as "Class{Name=value,...}"); an array as its elements
    // separated by ","; null as the empty text. A real has as many digits as it takes to
    // read the same number again; "INF", "-INF" and "NaN" are the special ones.
    std::string toText() const;

private:
    Value(Type type, bool array, Data data) : type_(type), array_(array), data_(std::move(data)) {}

    Type type_ = Type::String;
    bool array_ = false;
    Data data_;
};

// Same type, same nullness, equal contents. Reference keys compare by key, not by host.
bool operator==(const Value& left, const Value& right);
inline bool operator!=(const Value& left, const Value& right) { return !(left == right); }

} // namespace qelo::cim
