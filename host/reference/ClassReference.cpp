#include "ClassReference.h"

#include <cim/ObjectPath.h>
#include <schema/Names.h>

#include <algorithm>
#include <stdexcept>
#include <string_view>

namespace qelo::reference {
namespace {

constexpr char kIntroduction[] =
    "# Class reference\n"
    "\n"
    "Made by `tools/class-reference` from the class schema (`schema/*.mof`), the registration\n"
    "(`schema/qelosim.reg`) and the instances that the providers make; not to be changed by hand.\n"
    "[client.md](client.md) tells what the values mean and where they come from.\n"
    "\n"
    "A key is marked with *. The column \"Declared by\" names the class that introduced the\n"
    "property. What a superclass declares and the provider never sets is absent from the\n"
    "instances.\n";

std::string code(const std::string& text) { return "`" + text + "`"; }

// A text that does not end the cell of a table.
std::string cell(std::string text) {
    for (std::size_t at = 0; (at = text.find('|', at)) != std::string::npos; at += 2) {
        text.insert(at, "\\");
    }
    return text;
}

std::string textOf(const std::vector<cim::Qualifier>& qualifiers, std::string_view name) {
    const cim::Qualifier* found = cim::findQualifier(qualifiers, name);
    return found == nullptr ? "" : found->value.toText();
}

std::vector<std::string> textsOf(const std::vector<cim::Qualifier>& qualifiers,
                                 std::string_view name) {
    std::vector<std::string> texts;
    const cim::Qualifier* found = cim::findQualifier(qualifiers, name);
    if (found != nullptr && found->value.isArray() && !found->value.isNull()) {
        for (const cim::Value& element : found->value.asArray()) {
            texts.push_back(element.toText());
        }
    }
    return texts;
}

std::string joined(const std::vector<std::string>& texts) {
    std::string all;
    for (const std::string& text : texts) {
        all += (all.empty() ? "" : ", ") + text;
    }
    return all;
}

// "0 Unknown, 2 Enabled": the values that an element may have, with their names.
std::string values(const std::vector<cim::Qualifier>& qualifiers) {
    std::vector<std::string> numbers = textsOf(qualifiers, "ValueMap");
    const std::vector<std::string> names = textsOf(qualifiers, "Values");
    for (std::size_t i = 0; i < numbers.size(); ++i) {
        numbers[i] = i < names.size() ? code(numbers[i]) + " " + names[i] : code(numbers[i]);
    }
    return joined(numbers);
}

std::string description(const cim::TypedElement& element) {
    std::string text = textOf(element.qualifiers, "Description");
    const std::string units = textOf(element.qualifiers, "Units");
    if (!units.empty()) {
        text += " Unit: " + units + ".";
    }
    const std::string known = values(element.qualifiers);
    if (!known.empty()) {
        text += " Values: " + known + ".";
    }
    return cell(text);
}

std::string type(const cim::TypedElement& element) {
    const std::string name = element.type == cim::Type::Reference ? element.referenceClass + " ref"
                                                                  : cim::typeName(element.type);
    return code(name + (element.array ? "[]" : ""));
}

bool contains(const std::vector<std::string>& names, const std::string& wanted) {
    return std::any_of(names.begin(), names.end(),
                       [&](const std::string& name) { return cim::sameName(name, wanted); });
}

void writeProperties(std::string& text, const cim::Class& known, const ServedClass& served) {
    std::vector<std::string> unset;
    text += "\n| Property | Type | Declared by | Description |\n|---|---|---|---|\n";
    for (const cim::PropertyDeclaration& property : known.properties) {
        const bool isSet = contains(served.properties, property.name);
        if (property.propagated && !isSet) {
            unset.push_back(code(property.name));
            continue;
        }
        const bool isKey = cim::hasFlag(property.qualifiers, "Key");
        text += "| " + code(property.name) + (isKey ? " *" : "") + " | " + type(property) + " | " +
                code(property.origin) + " | " + description(property) +
                (isSet ? "" : " Never set.") + " |\n";
    }
    if (!unset.empty()) {
        text += "\nInherited and never set: " + joined(unset) + ".\n";
    }
}

std::string direction(const cim::ParameterDeclaration& parameter) {
    const cim::Qualifier* in = cim::findQualifier(parameter.qualifiers, "In");
    const bool comesIn = in == nullptr || cim::hasFlag(parameter.qualifiers, "In");
    const bool goesOut = cim::hasFlag(parameter.qualifiers, "Out");
    return goesOut ? (comesIn ? "in, out" : "out") : "in";
}

void writeMethod(std::string& text, const cim::MethodDeclaration& method) {
    const bool isStatic = cim::hasFlag(method.qualifiers, "Static");
    text += "\n### " + method.name + "\n\n" + textOf(method.qualifiers, "Description") +
            " Returns " + code(cim::typeName(method.returnType)) + "." +
            (isStatic ? " Asked of the class.\n" : "\n");
    if (method.parameters.empty()) {
        return;
    }
    text += "\n| Parameter | Type | Direction | Required | Description |\n|---|---|---|---|---|\n";
    for (const cim::ParameterDeclaration& parameter : method.parameters) {
        text += "| " + code(parameter.name) + " | " + type(parameter) + " | " +
                direction(parameter) + " | " +
                (cim::hasFlag(parameter.qualifiers, "Required") ? "yes" : "no") + " | " +
                description(parameter) + " |\n";
    }
}

// Methods of superclasses are declared for the sake of the schema; no provider has them.
void writeMethods(std::string& text, const cim::Class& known) {
    std::vector<std::string> inherited;
    for (const cim::MethodDeclaration& method : known.methods) {
        if (method.propagated) {
            inherited.push_back(code(method.name));
        }
    }
    if (!inherited.empty()) {
        text +=
            "\nInherited methods, which the provider does not have: " + joined(inherited) + ".\n";
    }
    for (const cim::MethodDeclaration& method : known.methods) {
        if (!method.propagated) {
            writeMethod(text, method);
        }
    }
}

std::string superclasses(const schema::ClassRepository& repository, const std::string& nameSpace,
                         const cim::Class& known) {
    std::string chain = code(known.name);
    for (const cim::Class* one = &known; one != nullptr && !one->superclass.empty();
         one = repository.find(nameSpace, one->superclass)) {
        chain += " < " + code(one->superclass);
    }
    return chain;
}

std::string provider(const broker::ProviderRegistration& registration) {
    std::vector<std::string> types;
    for (const broker::ProviderType one : broker::allProviderTypes) {
        if (registration.types.has(one)) {
            types.push_back(schema::foldedName(broker::providerTypeName(one)));
        }
    }
    return code(registration.provider) + " of " + code("lib" + registration.library + ".so.1") +
           " (" + joined(types) + ")";
}

} // namespace

std::string classReference(const schema::ClassRepository& repository,
                           const std::vector<ServedClass>& classes) {
    std::string text = kIntroduction;
    for (const ServedClass& served : classes) {
        const broker::ProviderRegistration& registration = served.registration;
        const std::string nameSpace =
            registration.nameSpaces.empty() ? "" : registration.nameSpaces.front();
        const cim::Class* known = repository.find(nameSpace, registration.className);
        if (known == nullptr) {
            throw std::runtime_error("no class " + registration.className + " in " + nameSpace);
        }
        text += "\n## " + known->name + "\n\n" + textOf(known->qualifiers, "Description") + "\n\n" +
                superclasses(repository, nameSpace, *known) + "  \nServed by " +
                provider(registration) + ".\n";
        writeProperties(text, *known, served);
        writeMethods(text, *known);
    }
    return text;
}

} // namespace qelo::reference
