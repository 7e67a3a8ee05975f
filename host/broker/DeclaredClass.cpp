#include "DeclaredClass.h"

#include "Convert.h"
#include "Names.h"

#include <cim/ObjectPath.h>

namespace qelo::broker {
namespace {

// At least twice the number of properties, so that searches stay short and come to an end.
std::size_t tableSize(std::size_t properties) {
    std::size_t size = 8;
    while (size < properties * 2) {
        size *= 2;
    }
    return size;
}

} // namespace

DeclaredClass::DeclaredClass(const cim::Class& declared)
    : table_(tableSize(declared.properties.size())), followers_(table_.size() + 1) {
    for (const cim::PropertyDeclaration& property : declared.properties) {
        DeclaredProperty entry;
        entry.name = property.name;
        entry.object = newString(names_, property.name, Ownership::Contained);
        entry.hash = nameHash(property.name);
        entry.type = cmpiType(property.type, property.array);
        entry.key = cim::hasFlag(property.qualifiers, "Key");
        entry.embedded = cim::hasFlag(property.qualifiers, "EmbeddedObject") ||
                         cim::findQualifier(property.qualifiers, "EmbeddedInstance") != nullptr;
        insert(entry);
    }
}

void DeclaredClass::insert(const DeclaredProperty& property) {
    const std::size_t mask = table_.size() - 1;
    std::size_t place = property.hash & mask;
    while (!table_[place].name.empty()) {
        place = (place + 1) & mask;
    }
    table_[place] = property;
}

const DeclaredProperty* DeclaredClass::find(std::string_view name, std::uint32_t hash) const {
    const std::size_t mask = table_.size() - 1;
    for (std::size_t place = hash & mask; !table_[place].name.empty(); place = (place + 1) & mask) {
        const DeclaredProperty& property = table_[place];
        if (property.hash == hash && cim::sameName(property.name, name)) {
            return &property;
        }
    }
    return nullptr;
}

} // namespace qelo::broker
