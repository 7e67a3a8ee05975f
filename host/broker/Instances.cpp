#include "Instances.h"

#include "Broker.h"
#include "Data.h"
#include "Slot.h"

namespace qelo::broker {
namespace {

void learnKeys(InstanceObject& instance) {
    instance.lastSet = nullptr; // of another class, perhaps
    if (!instance.broker) {
        return;
    }
    const ObjectPathObject& path = *instance.path;
    instance.declared =
        instance.broker->declaredClass(path.nameSpace->view(), path.className->view());
    if (instance.declared) {
        return;
    }
    const auto names = instance.broker->keyNames(path.nameSpace->view(), path.className->view());
    instance.keysKnown = names.has_value();
    if (!names) {
        return;
    }
    for (const std::string& name : *names) {
        instance.keyNames.add(*instance.arena, name);
    }
}

bool canBeKey(const CMPIData& data) {
    return (data.state & CMPI_nullValue) == 0 && (data.type & CMPI_ARRAY) == 0 &&
           data.type != CMPI_instance;
}

// The declaration of a property; null when the class or the property is not known.
const DeclaredProperty* declaredProperty(const InstanceObject& instance, std::string_view name,
                                         std::uint32_t hash) {
    return instance.declared ? instance.declared->find(name, hash) : nullptr;
}

// The one that the name is likely to mean, if it does, in the spelling of the declaration.
const DeclaredProperty* expectedProperty(const InstanceObject& instance, std::string_view name) {
    if (!instance.declared) {
        return nullptr;
    }
    const DeclaredProperty* expected = instance.declared->likelyAfter(instance.lastSet);
    return expected && expected->name == name ? expected : nullptr;
}

void noteSet(InstanceObject& instance, const DeclaredProperty* declared) {
    if (declared && instance.declared->likelyAfter(instance.lastSet) != declared) {
        instance.declared->noteFollower(instance.lastSet, *declared);
    }
    instance.lastSet = declared;
}

// Refuses what contradicts the class. A null of no type gets the declared one.
void checkDeclared(const InstanceObject& instance, const DeclaredProperty* declared,
                   CMPIData& data) {
    if (!instance.declared) {
        return;
    }
    if (!declared) {
        throw Refusal{CMPI_RC_ERR_NO_SUCH_PROPERTY};
    }
    if (data.type == CMPI_null) {
        data.type = declared->type;
    }
    if (!declared->accepts(data.type)) {
        throw Refusal{CMPI_RC_ERR_TYPE_MISMATCH};
    }
}

bool isKey(InstanceObject& instance, std::string_view name, std::uint32_t hash,
           const CMPIData& data, const DeclaredProperty* declared) {
    if (!canBeKey(data)) {
        return false;
    }
    if (instance.declared) {
        return declared && declared->key;
    }
    if (instance.keyNames.has(name, hash) || instance.path->keys.find(name, hash)) {
        return true;
    }
    return !instance.keysKnown && instance.keyNames.empty() && data.type == CMPI_ref;
}

void noteKey(InstanceObject& instance, std::string_view name, std::uint32_t hash,
             const CMPIData& data, const DeclaredProperty* declared) {
    if (!isKey(instance, name, hash, data, declared)) {
        return;
    }
    // Text never changes once made and can be shared; a path could be changed from outside.
    Arena& arena = *instance.arena;
    const CMPIData key = data.type == CMPI_ref ? copyData(arena, data) : data;
    instance.path->keys.set(arena, name, hash, key, nullptr);
}

void noteKeys(InstanceObject& instance, const EntryList& properties) {
    for (const Entry& entry : properties) {
        noteKey(instance, entry.name->view(), entry.hash, entry.data,
                declaredProperty(instance, entry.name->view(), entry.hash));
    }
}

void addNames(Arena& arena, NameSet& set, const char** names) {
    for (; names && *names; ++names) {
        set.add(arena, *names);
    }
}

// Sorts all properties into shown and hidden ones by the filter that now holds.
void applyFilter(InstanceObject& instance) {
    const EntryList shown = instance.properties;
    const EntryList hidden = instance.hidden;
    EntryList nowShown;
    EntryList nowHidden;
    for (const EntryList* list : {&shown, &hidden}) {
        for (const Entry& entry : *list) {
            const bool keep =
                !instance.filtered || instance.filter.has(entry.name->view(), entry.hash);
            (keep ? nowShown : nowHidden).append(*instance.arena, entry);
        }
    }
    instance.properties = nowShown;
    instance.hidden = nowHidden;
}

} // namespace

InstanceObject* newInstance(Arena& arena, const ObjectPathObject& path, Ownership owner,
                            const Broker* broker) {
    auto* instance = arena.make<InstanceObject>(&arena, owner);
    instance->path = copyOf(path, arena, Ownership::Contained);
    instance->broker = broker;
    instance->properties.reserve(arena, arena.usualPropertyCount());
    learnKeys(*instance);
    return instance;
}

void setProperty(InstanceObject& instance, std::string_view name, CMPIData data,
                 StringObject* origin) {
    const DeclaredProperty* declared = expectedProperty(instance, name);
    StringObject* const object = declared ? declared->object : nullptr;
    const std::uint32_t hash = declared ? declared->hash : nameHash(name);
    if (!declared && instance.declared) {
        declared = instance.declared->find(name, hash);
    }
    checkDeclared(instance, declared, data);
    noteKey(instance, name, hash, data, declared);
    if (instance.filtered && !instance.filter.has(name, hash)) {
        return;
    }
    instance.properties.set(*instance.arena, EntryName{name, hash, object}, data, origin);
    noteSet(instance, declared);
    instance.arena->notePropertyCount(instance.properties.size());
}

void setPropertyFilter(InstanceObject& instance, const char** properties, const char** keys) {
    Arena& arena = *instance.arena;
    instance.filtered = properties != nullptr;
    instance.filter.clear();
    addNames(arena, instance.filter, properties);
    if (!instance.declared) {
        addNames(arena, instance.keyNames, keys);
    }
    if (instance.properties.size() + instance.hidden.size() == 0) {
        return;
    }
    noteKeys(instance, instance.properties);
    noteKeys(instance, instance.hidden);
    applyFilter(instance);
}

void setObjectPath(InstanceObject& instance, const ObjectPathObject& path) {
    instance.path = copyOf(path, *instance.arena, Ownership::Contained);
    learnKeys(instance);
}

} // namespace qelo::broker
