#include "Instances.h"

#include "Broker.h"
#include "Data.h"

namespace qelo::broker {
namespace {

void learnKeys(InstanceObject& instance) {
    if (!instance.broker) {
        return;
    }
    const ObjectPathObject& path = *instance.path;
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

bool isKey(InstanceObject& instance, std::string_view name, std::uint32_t hash,
           const CMPIData& data) {
    if (!canBeKey(data)) {
        return false;
    }
    if (instance.keyNames.has(name, hash) || instance.path->keys.find(name, hash)) {
        return true;
    }
    return !instance.keysKnown && instance.keyNames.empty() && data.type == CMPI_ref;
}

void noteKey(InstanceObject& instance, std::string_view name, std::uint32_t hash,
             const CMPIData& data) {
    if (!isKey(instance, name, hash, data)) {
        return;
    }
    // Text never changes once made and can be shared; a path could be changed from outside.
    Arena& arena = *instance.arena;
    const CMPIData key = data.type == CMPI_ref ? copyData(arena, data) : data;
    instance.path->keys.set(arena, name, hash, key, nullptr);
}

void noteKeys(InstanceObject& instance, const EntryList& properties) {
    for (const Entry& entry : properties) {
        noteKey(instance, entry.name->view(), entry.hash, entry.data);
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

void setProperty(InstanceObject& instance, std::string_view name, const CMPIData& data,
                 StringObject* origin) {
    const std::uint32_t hash = nameHash(name);
    noteKey(instance, name, hash, data);
    if (instance.filtered && !instance.filter.has(name, hash)) {
        return;
    }
    instance.properties.set(*instance.arena, name, hash, data, origin);
    instance.arena->notePropertyCount(instance.properties.size());
}

void setPropertyFilter(InstanceObject& instance, const char** properties, const char** keys) {
    Arena& arena = *instance.arena;
    instance.filtered = properties != nullptr;
    instance.filter.clear();
    addNames(arena, instance.filter, properties);
    addNames(arena, instance.keyNames, keys);
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
