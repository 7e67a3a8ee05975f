// Static instances.
#include "MofParser.h"

namespace qelo::schema {

void MofParser::instanceProperty(const cim::Class& known, cim::Instance& instance) {
    qualifierList(); // those of single values mean nothing here
    const Position position = tokens_.peek().position;
    const std::string name = tokens_.expectName("the name of a property");
    const cim::PropertyDeclaration* declared = known.property(name);
    if (declared == nullptr) {
        tokens_.fail(position, "class " + known.name + " has no property " + name);
    }
    if (instance.property(name) != nullptr) {
        tokens_.fail(position, "the property is given twice");
    }
    tokens_.expectSymbol('=');
    instance.setProperty(declared->name, typed(tokens_.initializer(), *declared), declared->origin);
    tokens_.expectSymbol(';');
}

void MofParser::instanceDeclaration() {
    tokens_.expectKeyword("instance");
    tokens_.expectKeyword("of");
    const Position position = tokens_.peek().position;
    const std::string className = tokens_.expectName("the name of a class");
    ClassRepository& repository = compilation_.repository();
    const cim::Class* known = repository.find(compilation_.nameSpace(), className);
    if (known == nullptr) {
        tokens_.fail(position, "no such class: " + className);
    }
    std::string alias;
    if (tokens_.skipKeyword("as")) {
        if (tokens_.peek().kind != TokenKind::Alias) {
            tokens_.failHere("an alias ($name) is expected behind \"as\"");
        }
        alias = tokens_.take().text;
    }
    cim::Instance instance(cim::ObjectPath(compilation_.nameSpace(), known->name));
    tokens_.expectSymbol('{');
    while (!tokens_.skipSymbol('}')) {
        instanceProperty(*known, instance);
    }
    tokens_.expectSymbol(';');
    at(position, [&] {
        const cim::ObjectPath path = repository.add(compilation_.nameSpace(), instance);
        if (!alias.empty()) {
            compilation_.setAlias(alias, path);
        }
    });
}

} // namespace qelo::schema
