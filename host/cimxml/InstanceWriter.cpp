#include "Characters.h"
#include "ElementWriter.h"

namespace qelo::cimxml {
namespace {

std::string_view elementName(const cim::Value& value) {
    if (value.type() == cim::Type::Reference) {
        return "PROPERTY.REFERENCE";
    }
    return value.isArray() ? "PROPERTY.ARRAY" : "PROPERTY";
}

// The qualifiers of a property are those of its declaration.
void appendPropertyQualifiers(std::string& out, std::string_view name,
                              const InstanceOptions& options) {
    if (!options.includeQualifiers || options.declaration == nullptr) {
        return;
    }
    if (const auto* declared = options.declaration->property(name)) {
        appendQualifiers(out, declared->qualifiers);
    }
}

void appendProperty(std::string& out, const cim::Instance::Property& property,
                    const InstanceOptions& options) {
    const std::string_view element = elementName(property.value);
    out += '<';
    out += element;
    out += " NAME=\"";
    appendAttributeText(out, property.name);
    out += '"';
    if (property.value.type() != cim::Type::Reference) {
        appendType(out, "TYPE", property.value.type());
    }
    if (options.includeClassOrigin && !property.origin.empty()) {
        appendAttribute(out, "CLASSORIGIN", property.origin);
    }
    out += '>';
    appendPropertyQualifiers(out, property.name, options);
    appendValue(out, property.value);
    out += "</";
    out += element;
    out += '>';
}

} // namespace

void appendInstance(std::string& out, const cim::Instance& instance,
                    const InstanceOptions& options) {
    out += "<INSTANCE CLASSNAME=\"";
    appendAttributeText(out, instance.className());
    out += "\">";
    if (options.includeQualifiers && options.declaration != nullptr) {
        appendQualifiers(out, options.declaration->qualifiers);
    }
    for (const auto& property : instance.properties()) {
        appendProperty(out, property, options);
    }
    out += "</INSTANCE>";
}

} // namespace qelo::cimxml
