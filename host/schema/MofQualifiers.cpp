// Qualifiers: their declarations, and the lists of them in front of everything else.
#include "MofParser.h"

#include "Names.h"

#include <cim/ValueParser.h>

#include <set>
#include <utility>

namespace qelo::schema {
namespace {

using Scope = cim::QualifierType::Scope;

constexpr std::size_t kMostQualifiers = 256;

constexpr std::pair<const char*, std::uint32_t> kScopes[] = {
    {"any", Scope::ScopeAny},
    {"schema", 0},
    {"qualifier", 0},
    {"class", Scope::ScopeClass},
    {"association", Scope::ScopeAssociation},
    {"indication", Scope::ScopeIndication},
    {"property", Scope::ScopeProperty},
    {"reference", Scope::ScopeReference},
    {"method", Scope::ScopeMethod},
    {"parameter", Scope::ScopeParameter},
};

} // namespace

std::uint32_t MofParser::scopes() {
    std::uint32_t scopes = 0;
    tokens_.expectSymbol('(');
    do {
        const Position position = tokens_.peek().position;
        const std::string name = tokens_.expectName("the name of an element");
        bool known = false;
        for (const auto& [word, scope] : kScopes) {
            if (cim::sameName(word, name)) {
                scopes |= scope;
                known = true;
            }
        }
        if (!known) {
            tokens_.fail(position, "no such scope: " + name);
        }
    } while (tokens_.skipSymbol(','));
    tokens_.expectSymbol(')');
    return scopes;
}

void MofParser::applyFlavor(const Token& word, cim::QualifierFlavor& flavor) const {
    if (isKeyword(word, "EnableOverride")) {
        flavor.overridable = true;
    } else if (isKeyword(word, "DisableOverride")) {
        flavor.overridable = false;
    } else if (isKeyword(word, "ToSubclass")) {
        flavor.toSubclass = true;
    } else if (isKeyword(word, "Restricted")) {
        flavor.toSubclass = false;
    } else if (isKeyword(word, "Translatable")) {
        flavor.translatable = true;
    } else if (!isKeyword(word, "ToInstance")) {
        tokens_.fail(word.position, "no such flavor: " + std::string(word.text));
    }
}

void MofParser::qualifierDeclaration() {
    const Position position = tokens_.take().position;
    cim::QualifierType declared;
    declared.name = tokens_.expectName("the name of a qualifier");
    tokens_.expectSymbol(':');
    const Position typePosition = tokens_.peek().position;
    const std::string typeName = tokens_.expectName("a type");
    const auto type = cim::typeOfName(typeName);
    if (!type) {
        tokens_.fail(typePosition, "no such type: " + typeName);
    }
    cim::TypedElement element;
    element.type = declared.type = *type;
    element.array = declared.array = tokens_.skipArrayBrackets(declared.arraySize);
    element.arraySize = declared.arraySize;
    declared.defaultValue = cim::Value::null(declared.type, declared.array);
    if (tokens_.skipSymbol('=')) {
        declared.defaultValue = typed(tokens_.initializer(), element);
    }
    tokens_.expectSymbol(',');
    tokens_.expectKeyword("Scope");
    declared.scopes = scopes();
    if (tokens_.skipSymbol(',')) {
        tokens_.expectKeyword("Flavor");
        tokens_.expectSymbol('(');
        do {
            applyFlavor(tokens_.take(), declared.flavor);
        } while (tokens_.skipSymbol(','));
        tokens_.expectSymbol(')');
    }
    tokens_.expectSymbol(';');
    at(position,
       [&] { compilation_.repository().add(compilation_.nameSpace(), std::move(declared)); });
}

MofParser::WrittenQualifier MofParser::writtenQualifier() {
    WrittenQualifier written;
    written.position = tokens_.peek().position;
    // "Association" and "Indication" are words of the grammar too, but read like any name.
    written.name = tokens_.expectName("the name of a qualifier");
    if (tokens_.skipSymbol('(')) {
        written.value = tokens_.initializer();
        tokens_.expectSymbol(')');
    } else if (tokens_.atSymbol('{')) {
        written.value = tokens_.initializer();
    }
    if (tokens_.skipSymbol(':')) {
        while (tokens_.peek().kind == TokenKind::Name) {
            written.flavors.push_back(tokens_.take());
        }
    }
    return written;
}

std::vector<MofParser::WrittenQualifier> MofParser::qualifierList() {
    std::vector<WrittenQualifier> list;
    if (!tokens_.skipSymbol('[')) {
        return list;
    }
    std::set<std::string> names;
    do {
        list.push_back(writtenQualifier());
        if (!names.insert(foldedName(list.back().name)).second) {
            tokens_.fail(list.back().position, "the qualifier is given twice");
        }
        if (list.size() > kMostQualifiers) {
            tokens_.failHere("too many qualifiers");
        }
    } while (tokens_.skipSymbol(','));
    tokens_.expectSymbol(']');
    return list;
}

cim::Value MofParser::qualifierValue(const WrittenQualifier& written,
                                     const cim::QualifierType* type) const {
    if (!written.value) {
        if (type == nullptr || (type->type == cim::Type::Boolean && !type->array)) {
            return cim::Value::boolean(true);
        }
        return type->defaultValue;
    }
    cim::TypedElement element;
    if (type != nullptr) {
        element.type = type->type;
        element.array = type->array;
        element.arraySize = type->arraySize;
    } else if (const auto inferred = inferredType(*written.value)) {
        element.type = *inferred;
        element.array = written.value->array;
    } else {
        tokens_.fail(written.position,
                     "the qualifier " + written.name +
                         " is not declared, and its value does not tell its type");
    }
    return typed(*written.value, element);
}

cim::Qualifier MofParser::qualifier(const WrittenQualifier& written, std::uint32_t scope) const {
    const cim::QualifierType* type =
        compilation_.repository().findQualifierType(compilation_.nameSpace(), written.name);
    if (type != nullptr && (type->scopes & scope) == 0) {
        tokens_.fail(written.position, "the qualifier " + written.name + " cannot stand here");
    }
    cim::Qualifier result;
    result.name = type != nullptr ? type->name : written.name;
    result.value = qualifierValue(written, type);
    if (type != nullptr) {
        result.flavor = type->flavor;
    }
    for (const Token& flavor : written.flavors) {
        applyFlavor(flavor, result.flavor);
    }
    return result;
}

std::vector<cim::Qualifier> MofParser::qualifiers(const std::vector<WrittenQualifier>& written,
                                                  std::uint32_t scope) const {
    std::vector<cim::Qualifier> result;
    result.reserve(written.size());
    for (const WrittenQualifier& one : written) {
        result.push_back(qualifier(one, scope));
    }
    return result;
}

} // namespace qelo::schema
