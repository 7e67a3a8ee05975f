#include "support/broker/Convert.h"

#include <cstring>

namespace qelo::test {

namespace {

constexpr CMPIType simpleType(CMPIType type) { return static_cast<CMPIType>(type & ~CMPI_ARRAY); }

// The value may be a variable of its own type, so it must not be read as a whole CMPIValue.
template <typename T> T load(const CMPIValue* value) {
    T result;
    // Of a pointer, the pointer itself is meant.
    std::memcpy(&result, static_cast<const void*>(value),
                sizeof result); // NOLINT(bugprone-sizeof-expression)
    return result;
}

Value scalarFromCmpi(const CMPIValue* value, CMPIType type) {
    switch (type) {
    case CMPI_boolean:
        return Value::boolean(load<CMPIBoolean>(value) != 0);
    case CMPI_uint8:
        return Value::uint8(load<CMPIUint8>(value));
    case CMPI_uint16:
        return Value::uint16(load<CMPIUint16>(value));
    case CMPI_uint32:
        return Value::uint32(load<CMPIUint32>(value));
    case CMPI_uint64:
        return Value::uint64(load<CMPIUint64>(value));
    case CMPI_sint8:
        return Value::sint8(load<CMPISint8>(value));
    case CMPI_sint16:
        return Value::sint16(load<CMPISint16>(value));
    case CMPI_sint32:
        return Value::sint32(load<CMPISint32>(value));
    case CMPI_sint64:
        return Value::sint64(load<CMPISint64>(value));
    case CMPI_real32:
        return Value::real32(load<CMPIReal32>(value));
    case CMPI_real64:
        return Value::real64(load<CMPIReal64>(value));
    default: {
        Value result = Value::uint16(load<CMPIChar16>(value));
        result.type = CMPI_char16;
        return result;
    }
    }
}

// An array of chars and one of strings hold the same.
bool holds(CMPIType arrayElements, CMPIType declared) {
    const auto plain = [](CMPIType type) { return type == CMPI_chars ? CMPI_string : type; };
    return plain(arrayElements) == plain(declared);
}

Value arrayFromCmpi(Call& call, const CMPIValue* value, CMPIType type) {
    const auto* const array = call.checked(load<const CMPIArray*>(value));
    if (array == nullptr) {
        return Value::nullOf(type);
    }
    const CMPIType elements = array->content->elementType;
    if (!holds(elements, simpleType(type))) {
        call.refuse(CMPI_RC_ERR_TYPE_MISMATCH,
                    "array of " + typeName(elements) + " for " + typeName(type));
        return Value::nullOf(type);
    }
    return Value::array(simpleType(type), array->content->elements);
}

Value objectFromCmpi(Call& call, const CMPIValue* value, CMPIType type) {
    if (type == CMPI_string) {
        if (const auto* string = call.checked(load<const CMPIString*>(value))) {
            return Value::string(*string->content);
        }
    } else if (type == CMPI_dateTime) {
        if (const auto* date = call.checked(load<const CMPIDateTime*>(value))) {
            return Value::dateTime(date->content->text);
        }
    } else if (type == CMPI_ref) {
        if (const auto* path = call.checked(load<const CMPIObjectPath*>(value))) {
            return Value::ref(*path->content);
        }
    } else if (const auto* instance = call.checked(load<const CMPIInstance*>(value))) {
        return Value::embedded(instance->content->visible());
    }
    return Value::nullOf(type);
}

// A new object with that content, or what the value's shape asks for instead.
template <typename Cmpi, typename Content>
Cmpi* objectFor(BrokerState& state, const Value& value, Content&& content) {
    if (value.shape == Value::Shape::Missing) {
        return nullptr;
    }
    if (value.shape == Value::Shape::WithoutHandle) {
        return state.makeWithoutHandle<Cmpi>();
    }
    return state.make<Cmpi>(std::forward<Content>(content));
}

void objectToCmpi(BrokerState& state, const Value& value, CMPIData& data) {
    switch (value.type) {
    case CMPI_string:
        data.value.string = objectFor<CMPIString>(state, value, value.text);
        return;
    case CMPI_dateTime:
        data.value.dateTime = objectFor<CMPIDateTime>(state, value, DateTimeContent{value.text});
        return;
    case CMPI_ref:
        data.value.ref = objectFor<CMPIObjectPath>(state, value, value.path ? *value.path : Path());
        return;
    default: {
        InstanceContent content;
        if (value.instance) {
            content.data = *value.instance;
        }
        data.value.inst = objectFor<CMPIInstance>(state, value, std::move(content));
        return;
    }
    }
}

CMPIType typeForReader(CMPIType type) {
    if (simpleType(type) != CMPI_chars) {
        return type;
    }
    return static_cast<CMPIType>(CMPI_string | (type & CMPI_ARRAY));
}

} // namespace

bool isKnownType(CMPIType type) {
    switch (simpleType(type)) {
    case CMPI_boolean:
    case CMPI_char16:
    case CMPI_real32:
    case CMPI_real64:
    case CMPI_uint8:
    case CMPI_uint16:
    case CMPI_uint32:
    case CMPI_uint64:
    case CMPI_sint8:
    case CMPI_sint16:
    case CMPI_sint32:
    case CMPI_sint64:
    case CMPI_instance:
    case CMPI_ref:
    case CMPI_string:
    case CMPI_chars:
    case CMPI_dateTime:
        return true;
    default:
        return false;
    }
}

Value fromCmpi(Call& call, const CMPIValue* value, CMPIType type) {
    if (!isKnownType(type)) {
        call.refuse(CMPI_RC_ERR_INVALID_DATA_TYPE, "unknown type " + typeName(type));
        return Value::nullOf(type);
    }
    if (value == nullptr) {
        return Value::nullOf(type);
    }
    if ((type & CMPI_ARRAY) != 0) {
        return arrayFromCmpi(call, value, type);
    }
    if (type == CMPI_chars) {
        return Value::chars(reinterpret_cast<const char*>(value));
    }
    if ((type & CMPI_ENC) != 0) {
        return objectFromCmpi(call, value, type);
    }
    return scalarFromCmpi(value, type);
}

CMPIData toCmpi(BrokerState& state, const Value& value) {
    CMPIData data = {typeForReader(value.type), CMPI_goodValue, {0}};
    if (value.isNull) {
        data.state = CMPI_nullValue;
    } else if ((value.type & CMPI_ARRAY) != 0) {
        data.value.array =
            state.make<CMPIArray>({typeForReader(simpleType(value.type)), value.elements});
    } else if ((value.type & CMPI_ENC) != 0) {
        Value readable = value;
        readable.type = data.type;
        objectToCmpi(state, readable, data);
    } else {
        data.value = value.scalar;
    }
    return data;
}

} // namespace qelo::test
