// Values as texts, of every type: what is read is printed so that it reads the same again.
#include "FuzzInput.h"

#include <cim/Utf8.h>
#include <cim/ValueParser.h>

#include <array>
#include <cmath>

namespace {

using namespace qelo::cim;
using qelo::fuzz::require;

constexpr std::array<Type, 16> types = {
    Type::Boolean, Type::Char16,   Type::UInt8,     Type::UInt16,  Type::UInt32, Type::UInt64,
    Type::SInt8,   Type::SInt16,   Type::SInt32,    Type::SInt64,  Type::Real32, Type::Real64,
    Type::String,  Type::DateTime, Type::Reference, Type::Instance};

bool isNaN(const Value& value) {
    const double* number = std::get_if<double>(&value.data());
    return number && std::isnan(*number);
}

void checkType(Type type, std::string_view text) {
    std::string error;
    const auto value = parseValue(type, text, error);
    if (!value) {
        require(!error.empty() && error.size() < 200);
        return;
    }
    require(value->type() == type && !value->isNull() && !value->isArray());
    const std::string printed = value->toText();
    const auto again = parseValue(type, printed, error);
    require(again.has_value());
    require(*again == *value || (isNaN(*again) && isNaN(*value)));
    require(again->toText() == printed);
    require(type != Type::Char16 || isValidUtf8(printed));
}

void checkName(std::string_view text) {
    const auto type = typeOfName(text);
    require(!type || typeOfName(typeName(*type)) == type);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = qelo::fuzz::viewOf(data, size);
    for (const Type type : types) {
        checkType(type, text);
    }
    checkName(text);
    return 0;
}
