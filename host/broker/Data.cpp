#include "Data.h"

#include "Slot.h"

#include <cstring>

namespace qelo::broker {
namespace {

CMPIType simpleType(CMPIType type) {
    return static_cast<CMPIType>(type & static_cast<CMPIType>(~CMPI_ARRAY));
}

bool isScalarNumber(CMPIType type) {
    switch (type) {
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
        return true;
    default:
        return false;
    }
}

bool isText(CMPIType type) {
    return type == CMPI_string || type == CMPI_chars || type == CMPI_charsptr;
}

bool isAllowed(CMPIType type, ValueUse use) {
    if (type == CMPI_null) {
        return use != ValueUse::Key;
    }
    if (type == CMPI_ptr) {
        return use == ValueUse::Context;
    }
    const bool array = (type & CMPI_ARRAY) != 0;
    if (use == ValueUse::Key && (array || type == CMPI_instance)) {
        return false;
    }
    return isElementType(simpleType(type));
}

// What a provider passes as value may be a bare variable of the type in question, smaller and
// less aligned than a CMPIValue: exactly the bytes of that type are read.
template <class T> T readAs(const void* value) {
    T out = {};
    // Of a pointer, the pointer itself is meant.
    std::memcpy(&out, value, sizeof out); // NOLINT(bugprone-sizeof-expression)
    return out;
}

std::size_t sizeOfNumber(CMPIType type) {
    switch (type) {
    case CMPI_boolean:
    case CMPI_uint8:
    case CMPI_sint8:
        return 1;
    case CMPI_char16:
    case CMPI_uint16:
    case CMPI_sint16:
        return 2;
    case CMPI_uint32:
    case CMPI_sint32:
    case CMPI_real32:
        return 4;
    default:
        return 8;
    }
}

CMPIData numberData(const void* value, CMPIType type) {
    CMPIData data = {};
    data.type = type;
    std::memcpy(&data.value, value, sizeOfNumber(type));
    if (type == CMPI_boolean) {
        data.value.boolean = data.value.boolean != 0 ? 1 : 0;
    }
    return data;
}

CMPIData stringData(Arena& arena, const char* text) {
    CMPIData data = nullData(CMPI_string);
    if (!text) {
        return data;
    }
    data.state = CMPI_goodValue;
    data.value.string = &newString(arena, text, Ownership::Contained)->cmpi;
    return data;
}

// An array handed in under `type` must have elements of that type.
CMPIData arrayData(Arena& arena, const CMPIArray* source, CMPIType type) {
    const ArrayObject& array = alive<ArrayObject>(source);
    if (array.elementType != simpleType(type)) {
        throw Refusal{CMPI_RC_ERR_TYPE_MISMATCH};
    }
    CMPIData data = nullData(type);
    data.state = CMPI_goodValue;
    data.value.array = const_cast<CMPIArray*>(source);
    return copyData(arena, data);
}

// A null object pointer stands for CIM NULL.
template <class T> void requireAliveIfGiven(const typename T::Cmpi* object, CMPIData& data) {
    if (!object) {
        data.state = CMPI_nullValue;
    } else {
        (void)alive<T>(object);
    }
}

CMPIData objectData(Arena& arena, const void* value, CMPIType type) {
    CMPIData data = {};
    data.type = type;
    data.value.dataPtr.ptr = readAs<void*>(value);
    switch (type) {
    case CMPI_string:
        requireAliveIfGiven<StringObject>(data.value.string, data);
        break;
    case CMPI_dateTime:
        requireAliveIfGiven<DateTimeObject>(data.value.dateTime, data);
        break;
    case CMPI_ref:
        requireAliveIfGiven<ObjectPathObject>(data.value.ref, data);
        break;
    default:
        requireAliveIfGiven<InstanceObject>(data.value.inst, data);
        break;
    }
    return copyData(arena, data);
}

template <class T> auto* copyPart(Arena& arena, typename T::Cmpi* part, int depth) {
    return &copyOf(alive<T>(part), arena, Ownership::Contained, depth)->cmpi;
}

} // namespace

CMPIType storedType(CMPIType type) {
    if (!isText(simpleType(type))) {
        return type;
    }
    return static_cast<CMPIType>(CMPI_string | (type & CMPI_ARRAY));
}

bool isElementType(CMPIType type) {
    return isScalarNumber(type) || isText(type) || type == CMPI_dateTime || type == CMPI_ref ||
           type == CMPI_instance;
}

CMPIData nullData(CMPIType type) {
    CMPIData data = {};
    data.type = type;
    data.state = CMPI_nullValue;
    return data;
}

CMPIData storeData(Arena& arena, const CMPIValue* value, CMPIType type, ValueUse use) {
    if (!isAllowed(type, use)) {
        throw Refusal{CMPI_RC_ERR_INVALID_DATA_TYPE};
    }
    const CMPIType stored = storedType(type);
    if (!value || type == CMPI_null) {
        return nullData(stored);
    }
    const void* place = value;
    if (type == CMPI_chars) {
        return stringData(arena, static_cast<const char*>(place));
    }
    if (type == CMPI_charsptr) {
        return stringData(arena, readAs<const char*>(place));
    }
    if ((type & CMPI_ARRAY) != 0) {
        const auto* array = readAs<const CMPIArray*>(place);
        return array ? arrayData(arena, array, stored) : nullData(stored);
    }
    if (type == CMPI_ptr) {
        CMPIData data = {};
        data.type = type;
        data.value.dataPtr = readAs<CMPIValuePtr>(place);
        return data;
    }
    return isScalarNumber(type) ? numberData(place, type) : objectData(arena, place, type);
}

CMPIData copyData(Arena& arena, const CMPIData& data, int depth) {
    CMPIData copy = data;
    if ((data.state & CMPI_nullValue) != 0) {
        copy.value = {};
        return copy;
    }
    if ((data.type & CMPI_ARRAY) != 0) {
        copy.value.array = copyPart<ArrayObject>(arena, data.value.array, depth + 1);
        return copy;
    }
    switch (data.type) {
    case CMPI_string:
        copy.value.string = copyPart<StringObject>(arena, data.value.string, depth + 1);
        break;
    case CMPI_dateTime:
        copy.value.dateTime = copyPart<DateTimeObject>(arena, data.value.dateTime, depth + 1);
        break;
    case CMPI_ref:
        copy.value.ref = copyPart<ObjectPathObject>(arena, data.value.ref, depth + 1);
        break;
    case CMPI_instance:
        copy.value.inst = copyPart<InstanceObject>(arena, data.value.inst, depth + 1);
        break;
    default:
        break;
    }
    return copy;
}

} // namespace qelo::broker
