#include "Describe.h"

#include "Convert.h"
#include "Result.h"
#include "Slot.h"

#include <algorithm>
#include <array>
#include <cstring>

namespace qelo::broker {
namespace {

constexpr std::array<std::string_view, 14> typeNames = {
    "CMPIContext",    "CMPIResult",     "CMPIString",    "CMPIArray",    "CMPIEnumeration",
    "CMPIInstance",   "CMPIObjectPath", "CMPIArgs",      "CMPIDateTime", "CMPISelectExp",
    "CMPISelectCond", "CMPISubCond",    "CMPIPredicate", "CMPIError",
};

// The two words that every object begins with.
struct AnyObject {
    const void* hdl;
    const void* ft;
};

template <class Visitor> auto visitObject(const void* object, Visitor visit) {
    AnyObject any = {};
    if (object) {
        std::memcpy(&any, object, sizeof any);
    }
    const auto as = [&](auto* type) {
        using T = std::remove_pointer_t<decltype(type)>;
        return visit(alive<T>(static_cast<const typename T::Cmpi*>(object)));
    };
    if (any.ft == &StringObject::table) {
        return as(static_cast<StringObject*>(nullptr));
    }
    if (any.ft == &DateTimeObject::table) {
        return as(static_cast<DateTimeObject*>(nullptr));
    }
    if (any.ft == &ArrayObject::table) {
        return as(static_cast<ArrayObject*>(nullptr));
    }
    if (any.ft == &ObjectPathObject::table) {
        return as(static_cast<ObjectPathObject*>(nullptr));
    }
    if (any.ft == &InstanceObject::table) {
        return as(static_cast<InstanceObject*>(nullptr));
    }
    if (any.ft == &ArgsObject::table) {
        return as(static_cast<ArgsObject*>(nullptr));
    }
    if (any.ft == &ContextObject::table) {
        return as(static_cast<ContextObject*>(nullptr));
    }
    if (any.ft == &EnumerationObject::table) {
        return as(static_cast<EnumerationObject*>(nullptr));
    }
    if (any.ft == &ErrorObject::table) {
        return as(static_cast<ErrorObject*>(nullptr));
    }
    if (any.ft == &ResultObject::table) {
        return as(static_cast<ResultObject*>(nullptr));
    }
    throw Refusal{CMPI_RC_ERR_INVALID_HANDLE};
}

std::string valueText(const CMPIData& data) {
    const cim::Value value = toCim(data);
    if (value.isNull()) {
        return "NULL";
    }
    if (value.isArray()) {
        return "{" + value.toText() + "}";
    }
    if (value.type() == cim::Type::String) {
        return "\"" + value.toText() + "\"";
    }
    return value.toText();
}

std::string entriesText(const EntryList& entries) {
    std::string text = "{";
    for (const Entry& entry : entries) {
        text.append(" ").append(entry.name->view()).append("=").append(valueText(entry.data)) +=
            ';';
    }
    return text + " }";
}

std::string describe(const StringObject& text) { return std::string(text.view()); }
std::string describe(const DateTimeObject& time) { return time.text; }
std::string describe(const ObjectPathObject& path) {
    return toCim(path).toText(path.host->length != 0);
}
std::string describe(const InstanceObject& instance) {
    return describe(*instance.path) + " " + entriesText(instance.properties);
}
std::string describe(const ArgsObject& args) { return entriesText(args.arguments); }
std::string describe(const ContextObject& context) {
    std::string text = "{";
    for (const Entry& entry : context.entries) {
        text.append(" ").append(entry.name->view()).append("=");
        text += entry.data.type == CMPI_ptr ? "pointer" : valueText(entry.data);
        text += ';';
    }
    return text + " }";
}
std::string describe(const ArrayObject& array) {
    std::string text = "{";
    for (CMPICount i = 0; i < array.size; ++i) {
        text.append(i == 0 ? "" : ", ").append(valueText(array.elements[i]));
    }
    return text + "}";
}
std::string describe(const EnumerationObject& enumeration) {
    return describe(*enumeration.elements);
}
std::string describe(const ErrorObject& error) {
    return "error " + std::to_string(static_cast<int>(error.statusCode)) +
           (error.message ? ": " + describe(*error.message) : "");
}
std::string describe(const ResultObject&) { return "result"; }

} // namespace

std::string_view objectTypeName(const void* object) {
    return visitObject(object, [](const auto& alive) {
        return std::string_view(std::decay_t<decltype(alive)>::typeName);
    });
}

bool isObjectTypeName(std::string_view name) {
    return std::find(typeNames.begin(), typeNames.end(), name) != typeNames.end();
}

std::string describeObject(const void* object) {
    return visitObject(object, [](const auto& alive) { return describe(alive); });
}

} // namespace qelo::broker
