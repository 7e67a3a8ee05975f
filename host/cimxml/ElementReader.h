// What the elements of DMTF DSP0201 mean: values, paths, instances and declarations out of a
// tree of elements. One reader for one document; it counts what embedded documents add.
//
// Every function throws NotValid for an element that is not what the standard says.
#pragma once

#include "Element.h"
#include "Request.h"

#include <cim/Class.h>
#include <cim/Instance.h>

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace qelo::cimxml {

struct XmlLimits;

class ElementReader {
public:
    explicit ElementReader(const ReadLimits& limits) : limits_(limits) {}

    // The type that TYPE (or PARAMTYPE) and EmbeddedObject name together; nothing when there
    // is no such attribute.
    static std::optional<cim::Type> typeOf(const Element& element, std::string_view attribute);

    // VALUE, VALUE.ARRAY, VALUE.REFERENCE, VALUE.REFARRAY, VALUE.NULL as a value of a type.
    cim::Value value(const Element& element, cim::Type type);
    static bool isValue(const Element& element);

    // The value that stands inside a property or argument of that type, or null.
    cim::Value content(const Element& element, cim::Type type, bool array);

    // What PARAMVALUE and RETURNVALUE hold. Without a type, what is not a reference or an
    // instance anyway is a string, and `typed` is false.
    struct Argument {
        cim::Value value;
        bool typed = false;
    };
    Argument argument(const Element& element);

    // INSTANCENAME, LOCALINSTANCEPATH, INSTANCEPATH, CLASSNAME, LOCALCLASSPATH, CLASSPATH,
    // and what OBJECTPATH and VALUE.REFERENCE hold of these.
    cim::ObjectPath path(const Element& element);
    static bool isPath(const Element& element);
    // LOCALNAMESPACEPATH: "root/cimv2".
    static std::string nameSpace(const Element& element);

    // INSTANCE, alone or with its path as VALUE.NAMEDINSTANCE, VALUE.INSTANCEWITHPATH,
    // VALUE.OBJECTWITHPATH, VALUE.OBJECTWITHLOCALPATH, VALUE.NAMEDOBJECT, VALUE.OBJECT.
    cim::Instance instance(const Element& element);
    // Whether one of these holds a class instead of an instance.
    static bool holdsClass(const Element& element);

    // CLASS, alone or as one of the VALUE.* above.
    cim::Class declaration(const Element& element);
    cim::QualifierType qualifierType(const Element& element);

private:
    cim::Value textValue(const Element& element, cim::Type type);
    cim::Value arrayValue(const Element& element, cim::Type type);
    cim::Value objectValue(const Element& element);
    cim::Value embedded(const Element& element);
    Element embeddedDocument(std::string_view text, const XmlLimits& limits);
    cim::Value keyValue(const Element& element);
    void addKey(cim::ObjectPath& path, const Element& binding);
    cim::ObjectPath instanceName(const Element& element);
    cim::ObjectPath located(const Element& element);
    cim::Instance plainInstance(const Element& element);
    cim::Instance::Property property(const Element& element);
    cim::Class plainClass(const Element& element);
    cim::Qualifier qualifier(const Element& element);
    cim::PropertyDeclaration propertyDeclaration(const Element& element);
    cim::MethodDeclaration methodDeclaration(const Element& element);
    cim::ParameterDeclaration parameterDeclaration(const Element& element);

    ReadLimits limits_;
    std::size_t embeddedElements_ = 0;
};

} // namespace qelo::cimxml
