#include "Declared.h"

#include <cim/ValueParser.h>

#include <optional>
#include <stdexcept>
#include <utility>

namespace qelo::schema {
namespace {

using cim::Type;
using cim::Value;

constexpr unsigned int kInvalidParameter = 4;
constexpr unsigned int kMethodNotFound = 17;
constexpr int kDeepestReference = 16;

[[noreturn]] void refuse(const std::string& text) {
    throw client::CimError(kInvalidParameter, text);
}

bool isInteger(Type type) {
    switch (type) {
    case Type::UInt8:
    case Type::UInt16:
    case Type::UInt32:
    case Type::UInt64:
    case Type::SInt8:
    case Type::SInt16:
    case Type::SInt32:
    case Type::SInt64:
        return true;
    default:
        return false;
    }
}

bool isReal(Type type) { return type == Type::Real32 || type == Type::Real64; }

// Turns values into those of declared elements of one namespace.
class Typing {
public:
    Typing(const ClassRepository& repository, std::string nameSpace)
        : repository_(repository), nameSpace_(std::move(nameSpace)) {}

    cim::ObjectPath path(const cim::ObjectPath& path, int depth) const;

    // `what` names the element in errors: key "Name".
    Value scalar(const Value& value, Type type, const std::string& what, int depth) const;

    // The same where every text is to be read as a value of the type, as in "5" for a number.
    Value parsed(const Value& value, Type type, const std::string& what) const;

private:
    cim::ObjectPath withKeyNamed(const cim::ObjectPath& path, const cim::Class& known) const;
    Value reference(const std::string& text, const std::string& what, int depth) const;
    static Value fromText(const std::string& text, Type type, const std::string& what);

    const ClassRepository& repository_;
    const std::string nameSpace_;
};

Value Typing::fromText(const std::string& text, Type type, const std::string& what) {
    std::string problem;
    auto value = cim::parseValue(type, text, problem);
    if (!value) {
        refuse(what + " must be of type " + cim::typeName(type) + ": " + problem);
    }
    return std::move(*value);
}

Value Typing::reference(const std::string& text, const std::string& what, int depth) const {
    std::string problem;
    auto path = cim::ObjectPath::parse(text, problem);
    if (!path) {
        refuse(what + " must be an object path: " + problem);
    }
    if (path->nameSpace().empty()) {
        path->setNameSpace(nameSpace_);
    }
    return Value::reference(this->path(*path, depth + 1));
}

Value Typing::scalar(const Value& value, Type type, const std::string& what, int depth) const {
    if (value.isNull()) {
        return Value::null(type);
    }
    if (value.type() == type) {
        return type == Type::Reference ? Value::reference(path(value.asReference(), depth + 1))
                                       : value;
    }
    if (value.type() == Type::String && type == Type::Reference) {
        return reference(value.asString(), what, depth);
    }
    const bool text =
        value.type() == Type::String && (type == Type::DateTime || type == Type::Char16);
    const bool number = (isInteger(value.type()) && (isInteger(type) || isReal(type))) ||
                        (isReal(value.type()) && isReal(type));
    if (!text && !number) {
        refuse(what + " must be of type " + cim::typeName(type) + ", not " +
               cim::typeName(value.type()));
    }
    return fromText(value.toText(), type, what);
}

Value Typing::parsed(const Value& value, Type type, const std::string& what) const {
    if (value.isNull()) {
        return Value::null(type);
    }
    if (value.type() != Type::String || type == Type::Reference) {
        return scalar(value, type, what, 0);
    }
    return fromText(value.asString(), type, what);
}

// The protocol allows the only key of a class to come without its name.
cim::ObjectPath Typing::withKeyNamed(const cim::ObjectPath& path, const cim::Class& known) const {
    const std::vector<std::string> names = repository_.keyNames(known);
    if (names.size() != 1) {
        refuse("class " + known.name + " has not one key; name them");
    }
    cim::ObjectPath result = path;
    result.clearKeys();
    result.setKey(names[0], path.keys()[0].value);
    return result;
}

cim::ObjectPath Typing::path(const cim::ObjectPath& path, int depth) const {
    if (depth > kDeepestReference) {
        refuse("references are nested too deeply");
    }
    const std::string& nameSpace = path.nameSpace().empty() ? nameSpace_ : path.nameSpace();
    const cim::Class* known = repository_.find(nameSpace, path.className());
    if (known == nullptr) {
        return path;
    }
    if (path.keys().size() == 1 && path.keys()[0].name.empty()) {
        return this->path(withKeyNamed(path, *known), depth);
    }
    cim::ObjectPath result = path;
    for (const cim::ObjectPath::Key& key : path.keys()) {
        const cim::PropertyDeclaration* declared = known->property(key.name);
        if (declared == nullptr || !cim::hasFlag(declared->qualifiers, "Key")) {
            refuse("class " + known->name + " has no key \"" + key.name + "\"");
        }
        result.setKey(key.name,
                      scalar(key.value, declared->type, "key \"" + key.name + "\"", depth));
    }
    return result;
}

// What is embedded is a string to the class, whatever it is to the client.
bool isEmbedded(const cim::TypedElement& declared) {
    return cim::findQualifier(declared.qualifiers, "EmbeddedInstance") != nullptr ||
           cim::hasFlag(declared.qualifiers, "EmbeddedObject");
}

Value argumentArray(const Typing& typing, const Value& value, Type type, const std::string& what) {
    if (value.isNull()) {
        return Value::null(type, true);
    }
    Value::Array elements;
    elements.reserve(value.asArray().size());
    for (const Value& element : value.asArray()) {
        elements.push_back(typing.parsed(element, type, what));
    }
    return Value::array(type, std::move(elements));
}

Value argumentValue(const Typing& typing, const UntypedArgument& argument,
                    const cim::ParameterDeclaration& declared) {
    const std::string what = "argument \"" + argument.name + "\"";
    const Value& value = argument.value;
    if (isEmbedded(declared) && value.type() == Type::Instance) {
        return value;
    }
    if (argument.typed && value.type() != declared.type) {
        refuse(what + " must be of type " + cim::typeName(declared.type) + ", not " +
               cim::typeName(value.type()));
    }
    if (value.isArray() != declared.array) {
        refuse(what + (declared.array ? " must be an array" : " must not be an array"));
    }
    if (argument.typed) {
        return value;
    }
    return declared.array ? argumentArray(typing, value, declared.type, what)
                          : typing.parsed(value, declared.type, what);
}

const cim::ParameterDeclaration* findParameter(const cim::MethodDeclaration& method,
                                               const std::string& name) {
    for (const cim::ParameterDeclaration& parameter : method.parameters) {
        if (cim::sameName(parameter.name, name)) {
            return &parameter;
        }
    }
    return nullptr;
}

client::Arguments asGiven(const std::vector<UntypedArgument>& arguments) {
    client::Arguments result;
    result.reserve(arguments.size());
    for (const UntypedArgument& argument : arguments) {
        result.emplace_back(argument.name, argument.value);
    }
    return result;
}

// Does not repeat what was given: a password with a comma in it, written where a comma ends an
// argument, arrives as the name of another one.
[[noreturn]] void refuseArgument(const cim::MethodDeclaration& method) {
    std::string text = "the method " + method.name + " has no such argument";
    const char* separator = "; it has ";
    for (const cim::ParameterDeclaration& parameter : method.parameters) {
        text += separator + parameter.name;
        separator = ", ";
    }
    refuse(text);
}

client::Arguments declaredArguments(const Typing& typing, const cim::MethodDeclaration& method,
                                    const std::vector<UntypedArgument>& arguments) {
    client::Arguments result;
    result.reserve(arguments.size());
    for (const UntypedArgument& argument : arguments) {
        const cim::ParameterDeclaration* parameter = findParameter(method, argument.name);
        if (parameter == nullptr) {
            refuseArgument(method);
        }
        cim::Value value = argumentValue(typing, argument, *parameter);
        if (!value.isNull()) {
            result.emplace_back(parameter->name, std::move(value));
        }
    }
    return result;
}

} // namespace

cim::ObjectPath withDeclaredKeys(const ClassRepository& repository, const cim::ObjectPath& path) {
    return Typing(repository, path.nameSpace()).path(path, 0);
}

DeclaredCall declaredCall(const ClassRepository& repository, const std::string& nameSpace,
                          const std::string& className, const std::string& method,
                          const std::vector<UntypedArgument>& arguments) {
    const cim::Class* known = repository.find(nameSpace, className);
    if (known == nullptr) {
        return {method, asGiven(arguments)};
    }
    const cim::MethodDeclaration* declared = known->method(method);
    if (declared == nullptr) {
        throw client::CimError(kMethodNotFound, known->name + " has no method \"" + method + "\"");
    }
    return {declared->name, declaredArguments(Typing(repository, nameSpace), *declared, arguments)};
}

} // namespace qelo::schema
