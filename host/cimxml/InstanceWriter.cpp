#include "ElementWriter.h"

namespace qelo::cimxml {
namespace {

struct Tags {
    std::string_view begin;
    std::string_view end;
};

Tags tagsOf(const cim::Value& value) {
    if (value.type() == cim::Type::Reference) {
        return {"<PROPERTY.REFERENCE NAME=\"", "</PROPERTY.REFERENCE>"};
    }
    return value.isArray() ? Tags{"<PROPERTY.ARRAY NAME=\"", "</PROPERTY.ARRAY>"}
                           : Tags{"<PROPERTY NAME=\"", "</PROPERTY>"};
}

// The qualifiers of a property are those of its declaration.
void appendPropertyQualifiers(std::string& out, std::string_view name,
                              const InstanceOptions& options) {
    if (options.declaration == nullptr) {
        return;
    }
    if (const auto* declared = options.declaration->property(name)) {
        appendQualifiers(out, declared->qualifiers);
    }
}

void addProperty(Pieces& out, const cim::Instance::Property& property,
                 const InstanceOptions& options) {
    const Tags tags = tagsOf(property.value);
    out.add(tags.begin);
    out.addAttributeText(property.name);
    out.add("\"");
    if (property.value.type() != cim::Type::Reference) {
        addType(out, "TYPE", property.value.type());
    }
    if (options.includeClassOrigin && !property.origin.empty()) {
        out.addAttribute("CLASSORIGIN", property.origin);
    }
    out.add(">");
    if (options.includeQualifiers) {
        appendPropertyQualifiers(out.flush(), property.name, options);
    }
    addValue(out, property.value);
    out.add(tags.end);
}

} // namespace

void addInstance(Pieces& out, const cim::Instance& instance, const InstanceOptions& options) {
    out.add("<INSTANCE CLASSNAME=\"");
    out.addAttributeText(instance.className());
    out.add("\">");
    if (options.includeQualifiers && options.declaration != nullptr) {
        appendQualifiers(out.flush(), options.declaration->qualifiers);
    }
    for (const auto& property : instance.properties()) {
        addProperty(out, property, options);
    }
    out.add("</INSTANCE>");
}

void appendInstance(std::string& out, const cim::Instance& instance,
                    const InstanceOptions& options) {
    Pieces pieces(out);
    addInstance(pieces, instance, options);
    pieces.flush();
}

} // namespace qelo::cimxml
