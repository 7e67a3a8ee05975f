#include "Convert.h"

#include "Slot.h"

#include <cim/DateTime.h>

#include <algorithm>

namespace qelo::broker {
namespace {

void checkDepth(int depth) {
    if (depth > maximumDepth) {
        throw Refusal{CMPI_RC_ERR_FAILED, "values are nested too deeply"};
    }
}

std::string textOf(const StringObject& text) { return std::string(text.view()); }

cim::Type cimType(CMPIType type) {
    switch (type & ~CMPI_ARRAY) {
    case CMPI_boolean:
        return cim::Type::Boolean;
    case CMPI_char16:
        return cim::Type::Char16;
    case CMPI_uint8:
        return cim::Type::UInt8;
    case CMPI_uint16:
        return cim::Type::UInt16;
    case CMPI_uint32:
        return cim::Type::UInt32;
    case CMPI_uint64:
        return cim::Type::UInt64;
    case CMPI_sint8:
        return cim::Type::SInt8;
    case CMPI_sint16:
        return cim::Type::SInt16;
    case CMPI_sint32:
        return cim::Type::SInt32;
    case CMPI_sint64:
        return cim::Type::SInt64;
    case CMPI_real32:
        return cim::Type::Real32;
    case CMPI_real64:
        return cim::Type::Real64;
    case CMPI_dateTime:
        return cim::Type::DateTime;
    case CMPI_ref:
        return cim::Type::Reference;
    case CMPI_instance:
        return cim::Type::Instance;
    default:
        return cim::Type::String; // CMPI_string, and CMPI_null, which is of no type at all
    }
}

cim::Value dateTimeValue(const CMPIDateTime* source) {
    const auto time = cim::DateTime::parse(alive<DateTimeObject>(source).text);
    return time ? cim::Value::dateTime(*time) : cim::Value::null(cim::Type::DateTime);
}

cim::Value scalarValue(const CMPIData& data, int depth) {
    const cim::Type type = cimType(data.type);
    const CMPIValue& value = data.value;
    switch (data.type) {
    case CMPI_boolean:
        return cim::Value::boolean(value.boolean != 0);
    case CMPI_char16:
    case CMPI_uint16:
        return cim::Value::unsignedInteger(type, value.uint16);
    case CMPI_uint8:
        return cim::Value::unsignedInteger(type, value.uint8);
    case CMPI_uint32:
        return cim::Value::unsignedInteger(type, value.uint32);
    case CMPI_uint64:
        return cim::Value::unsignedInteger(type, value.uint64);
    case CMPI_sint8:
        return cim::Value::signedInteger(type, value.sint8);
    case CMPI_sint16:
        return cim::Value::signedInteger(type, value.sint16);
    case CMPI_sint32:
        return cim::Value::signedInteger(type, value.sint32);
    case CMPI_sint64:
        return cim::Value::signedInteger(type, value.sint64);
    case CMPI_real32:
        return cim::Value::real(type, static_cast<double>(value.real32));
    case CMPI_real64:
        return cim::Value::real(type, value.real64);
    case CMPI_string:
        return cim::Value::string(textOf(alive<StringObject>(value.string)));
    case CMPI_dateTime:
        return dateTimeValue(value.dateTime);
    case CMPI_ref:
        return cim::Value::reference(toCim(alive<ObjectPathObject>(value.ref), depth + 1));
    case CMPI_instance:
        return cim::Value::instance(toCim(alive<InstanceObject>(value.inst), {}, depth + 1));
    default:
        return cim::Value::null(type);
    }
}

cim::Value arrayValue(const ArrayObject& array, int depth) {
    cim::Value::Array elements;
    elements.reserve(array.size);
    for (CMPICount i = 0; i < array.size; ++i) {
        elements.push_back(toCim(array.elements[i], depth));
    }
    return cim::Value::array(cimType(array.elementType), std::move(elements));
}

// Into a value that may have been filled before. Most of them are texts.
void assign(cim::Value& to, const CMPIData& data, int depth) {
    if (data.type == CMPI_string && (data.state & CMPI_nullValue) == 0) {
        to.setString(alive<StringObject>(data.value.string).view());
    } else {
        to = toCim(data, depth);
    }
}

void assign(cim::ObjectPath& to, const ObjectPathObject& path, int depth) {
    checkDepth(depth);
    to.assignNames(path.host->view(), path.nameSpace->view(), path.className->view());
    std::vector<cim::ObjectPath::Key>& keys = to.mutableKeys();
    keys.resize(path.keys.size());
    for (std::size_t i = 0; i < keys.size(); ++i) {
        const Entry& key = path.keys[i];
        keys[i].name.assign(key.name->view());
        assign(keys[i].value, key.data, depth);
    }
}

bool isWanted(const client::PropertyList& properties, std::string_view name) {
    return !properties ||
           std::any_of(properties->begin(), properties->end(),
                       [&](const std::string& wanted) { return cim::sameName(wanted, name); });
}

std::string entryText(const ContextObject& context, const char* name) {
    const Entry* entry = context.entries.find(name);
    if (!entry || entry->data.type != CMPI_string || (entry->data.state & CMPI_nullValue) != 0) {
        return {};
    }
    return textOf(alive<StringObject>(entry->data.value.string));
}

} // namespace

cim::Value toCim(const CMPIData& data, int depth) {
    checkDepth(depth);
    const bool array = (data.type & CMPI_ARRAY) != 0;
    if ((data.state & CMPI_nullValue) != 0) {
        return cim::Value::null(cimType(data.type), array);
    }
    return array ? arrayValue(alive<ArrayObject>(data.value.array), depth)
                 : scalarValue(data, depth);
}

cim::ObjectPath toCim(const ObjectPathObject& path, int depth) {
    cim::ObjectPath out;
    assign(out, path, depth);
    return out;
}

cim::Instance toCim(const InstanceObject& instance, const client::PropertyList& properties,
                    int depth) {
    cim::Instance out;
    assign(out, instance, properties, depth);
    return out;
}

void assign(cim::Instance& to, const InstanceObject& instance,
            const client::PropertyList& properties, int depth) {
    checkDepth(depth);
    assign(to.mutablePath(), *instance.path, depth);
    std::vector<cim::Instance::Property>& out = to.mutableProperties();
    out.reserve(instance.properties.size());
    std::size_t count = 0;
    for (const Entry& entry : instance.properties) {
        if (!isWanted(properties, entry.name->view())) {
            continue;
        }
        if (count == out.size()) {
            out.emplace_back();
        }
        cim::Instance::Property& property = out[count++];
        property.name.assign(entry.name->view());
        property.origin.assign(entry.origin ? entry.origin->view() : std::string_view());
        assign(property.value, entry.data, depth);
    }
    out.resize(count);
}

client::Arguments toCim(const ArgsObject& args) {
    client::Arguments out;
    out.reserve(args.arguments.size());
    for (const Entry& entry : args.arguments) {
        out.emplace_back(textOf(*entry.name), toCim(entry.data));
    }
    return out;
}

OperationContext toCim(const ContextObject& context) {
    OperationContext out;
    out.principal = entryText(context, CMPIPrincipal);
    out.role = entryText(context, CMPIRole);
    out.acceptLanguage = entryText(context, CMPIAcceptLanguage);
    out.contentLanguage = entryText(context, CMPIContentLanguage);
    const Entry* flags = context.entries.find(CMPIInvocationFlags);
    if (flags && flags->data.type == CMPI_uint32 && (flags->data.state & CMPI_nullValue) == 0) {
        out.invocationFlags = flags->data.value.uint32;
    }
    return out;
}

client::PropertyList propertyList(const char** names) {
    if (!names) {
        return std::nullopt;
    }
    std::vector<std::string> list;
    for (; *names; ++names) {
        list.emplace_back(*names);
    }
    return list;
}

} // namespace qelo::broker
