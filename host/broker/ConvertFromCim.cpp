#include "Convert.h"

#include "Data.h"
#include "Instances.h"
#include "Slot.h"

namespace qelo::broker {
namespace {

void checkDepth(int depth) {
    if (depth > maximumDepth) {
        throw Refusal{CMPI_RC_ERR_FAILED, "values are nested too deeply"};
    }
}

CMPIType simpleCmpiType(cim::Type type) {
    switch (type) {
    case cim::Type::Boolean:
        return CMPI_boolean;
    case cim::Type::Char16:
        return CMPI_char16;
    case cim::Type::UInt8:
        return CMPI_uint8;
    case cim::Type::UInt16:
        return CMPI_uint16;
    case cim::Type::UInt32:
        return CMPI_uint32;
    case cim::Type::UInt64:
        return CMPI_uint64;
    case cim::Type::SInt8:
        return CMPI_sint8;
    case cim::Type::SInt16:
        return CMPI_sint16;
    case cim::Type::SInt32:
        return CMPI_sint32;
    case cim::Type::SInt64:
        return CMPI_sint64;
    case cim::Type::Real32:
        return CMPI_real32;
    case cim::Type::Real64:
        return CMPI_real64;
    case cim::Type::String:
        return CMPI_string;
    case cim::Type::DateTime:
        return CMPI_dateTime;
    case cim::Type::Reference:
        return CMPI_ref;
    case cim::Type::Instance:
        return CMPI_instance;
    }
    return CMPI_string;
}

CMPIValue integerValue(const cim::Value& value) {
    CMPIValue out = {};
    switch (value.type()) {
    case cim::Type::UInt8:
        out.uint8 = static_cast<CMPIUint8>(value.asUnsigned());
        break;
    case cim::Type::Char16:
    case cim::Type::UInt16:
        out.uint16 = static_cast<CMPIUint16>(value.asUnsigned());
        break;
    case cim::Type::UInt32:
        out.uint32 = static_cast<CMPIUint32>(value.asUnsigned());
        break;
    case cim::Type::UInt64:
        out.uint64 = value.asUnsigned();
        break;
    case cim::Type::SInt8:
        out.sint8 = static_cast<CMPISint8>(value.asSigned());
        break;
    case cim::Type::SInt16:
        out.sint16 = static_cast<CMPISint16>(value.asSigned());
        break;
    case cim::Type::SInt32:
        out.sint32 = static_cast<CMPISint32>(value.asSigned());
        break;
    default:
        out.sint64 = value.asSigned();
        break;
    }
    return out;
}

// A provider would see the text only up to a zero, which may be another text altogether.
StringObject* wholeText(Arena& arena, const std::string& text) {
    if (text.find('\0') != std::string::npos) {
        throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER, "a text contains a zero byte"};
    }
    return newString(arena, text, Ownership::Contained);
}

CMPIValue scalarValue(Arena& arena, const cim::Value& value, int depth) {
    CMPIValue out = {};
    switch (value.type()) {
    case cim::Type::Boolean:
        out.boolean = value.asBoolean() ? 1 : 0;
        return out;
    case cim::Type::Real32:
        out.real32 = static_cast<CMPIReal32>(value.asReal());
        return out;
    case cim::Type::Real64:
        out.real64 = value.asReal();
        return out;
    case cim::Type::String:
        out.string = &wholeText(arena, value.asString())->cmpi;
        return out;
    case cim::Type::DateTime:
        out.dateTime = &newDateTime(arena, value.asDateTime().text(), Ownership::Contained)->cmpi;
        return out;
    case cim::Type::Reference:
        out.ref = &fromCim(arena, value.asReference(), Ownership::Contained, depth + 1)->cmpi;
        return out;
    case cim::Type::Instance:
        out.inst =
            &fromCim(arena, value.asInstance(), Ownership::Contained, nullptr, depth + 1)->cmpi;
        return out;
    default:
        return integerValue(value);
    }
}

CMPIData stringEntry(Arena& arena, const std::string& text) {
    CMPIData data = {};
    data.type = CMPI_string;
    data.value.string = &wholeText(arena, text)->cmpi;
    return data;
}

} // namespace

CMPIType cmpiType(cim::Type type, bool array) {
    const CMPIType simple = simpleCmpiType(type);
    return array ? static_cast<CMPIType>(simple | CMPI_ARRAY) : simple;
}

CMPIData fromCim(Arena& arena, const cim::Value& value, int depth) {
    checkDepth(depth);
    CMPIData data = nullData(cmpiType(value.type(), value.isArray()));
    if (value.isNull()) {
        return data;
    }
    data.state = CMPI_goodValue;
    if (!value.isArray()) {
        data.value = scalarValue(arena, value, depth);
        return data;
    }
    const cim::Value::Array& elements = value.asArray();
    ArrayObject* array = newArray(arena, static_cast<CMPICount>(elements.size()),
                                  cmpiType(value.type(), false), Ownership::Contained);
    for (CMPICount i = 0; i < array->size; ++i) {
        array->elements[i] = fromCim(arena, elements[i], depth);
    }
    data.value.array = &array->cmpi;
    return data;
}

ObjectPathObject* fromCim(Arena& arena, const cim::ObjectPath& path, Ownership owner, int depth) {
    checkDepth(depth);
    ObjectPathObject* out = newObjectPath(arena, path.nameSpace(), path.className(), owner);
    out->host = arena.name(path.host(), nameHash(path.host()));
    for (const cim::ObjectPath::Key& key : path.keys()) {
        out->keys.set(arena, key.name, fromCim(arena, key.value, depth));
    }
    return out;
}

InstanceObject* fromCim(Arena& arena, const cim::Instance& instance, Ownership owner,
                        const Broker* broker, int depth) {
    checkDepth(depth);
    const ObjectPathObject* path = fromCim(arena, instance.path(), Ownership::Contained, depth);
    InstanceObject* out = newInstance(arena, *path, owner, broker);
    for (const cim::Instance::Property& property : instance.properties()) {
        const std::string& from = property.origin;
        StringObject* origin = from.empty() ? nullptr : arena.name(from, nameHash(from));
        out->properties.set(arena, property.name, nameHash(property.name),
                            fromCim(arena, property.value, depth), origin);
    }
    return out;
}

ArgsObject* fromCim(Arena& arena, const client::Arguments& arguments, Ownership owner) {
    auto* out = arena.make<ArgsObject>(&arena, owner);
    for (const auto& [name, value] : arguments) {
        out->arguments.set(arena, name, fromCim(arena, value));
    }
    return out;
}

ContextObject* fromCim(Arena& arena, const OperationContext& context, Ownership owner) {
    auto* out = arena.make<ContextObject>(&arena, owner);
    CMPIData flags = {};
    flags.type = CMPI_uint32;
    flags.value.uint32 = context.invocationFlags;
    out->entries.set(arena, CMPIInvocationFlags, flags);
    out->entries.set(arena, CMPIPrincipal, stringEntry(arena, context.principal));
    out->entries.set(arena, CMPIRole, stringEntry(arena, context.role));
    out->entries.set(arena, CMPIAcceptLanguage, stringEntry(arena, context.acceptLanguage));
    out->entries.set(arena, CMPIContentLanguage, stringEntry(arena, context.contentLanguage));
    return out;
}

} // namespace qelo::broker
