#include "Objects.h"

#include "Data.h"
#include "Slot.h"

#include <cim/ObjectPath.h>

#include <cstring>

namespace qelo::broker {
namespace {

// 24 bytes each; nothing a provider lists comes near.
constexpr CMPICount maximumArraySize = 1U << 24;

void checkDepth(int depth) {
    if (depth > maximumDepth) {
        throw Refusal{CMPI_RC_ERR_FAILED, "values are nested too deeply"};
    }
}

StringObject* partOf(const StringObject* part, Arena& arena) {
    return part ? copyOf(*part, arena, Ownership::Contained) : nullptr;
}

void copyEntries(EntryList& to, const EntryList& from, Arena& arena, int depth) {
    to.reserve(arena, from.size());
    for (const Entry& entry : from) {
        to.append(arena, Entry{arena.name(entry.name->view(), entry.hash), entry.hash,
                               copyData(arena, entry.data, depth), partOf(entry.origin, arena)});
    }
}

void copyNames(NameSet& to, const NameSet& from, Arena& arena) {
    for (const StringObject* name : from) {
        to.add(arena, name->view());
    }
}

} // namespace

Entry* EntryList::find(std::string_view name, std::uint32_t hash) {
    if ((hashes_ & bitOf(hash)) == 0) {
        return nullptr;
    }
    for (Entry& entry : entries_) {
        if (entry.hash == hash && cim::sameName(entry.name->view(), name)) {
            return &entry;
        }
    }
    return nullptr;
}

const Entry* EntryList::find(std::string_view name) const {
    return const_cast<EntryList*>(this)->find(name, nameHash(name));
}

void EntryList::set(Arena& arena, const EntryName& name, const CMPIData& data,
                    StringObject* origin) {
    if (Entry* entry = find(name.text, name.hash)) {
        entry->data = data;
        entry->origin = origin;
        return;
    }
    StringObject* const object = name.object ? name.object : arena.name(name.text, name.hash);
    append(arena, Entry{object, name.hash, data, origin});
}

void NameSet::add(Arena& arena, std::string_view name) {
    const std::uint32_t hash = nameHash(name);
    if (has(name, hash)) {
        return;
    }
    names_.append(arena, arena.name(name, hash));
    hashes_.append(arena, hash);
}

bool NameSet::has(std::string_view name, std::uint32_t hash) const {
    for (std::size_t i = 0; i < names_.size(); ++i) {
        if (hashes_[i] == hash && cim::sameName(names_[i]->view(), name)) {
            return true;
        }
    }
    return false;
}

StringObject* newString(Arena& arena, std::string_view text, Ownership owner) {
    if (text.size() > UINT32_MAX - 1) {
        throw std::bad_alloc();
    }
    // Object and text in one piece.
    void* place = arena.allocate(sizeof(StringObject) + text.size() + 1);
    char* copy = static_cast<char*>(place) + sizeof(StringObject);
    if (!text.empty()) {
        std::memcpy(copy, text.data(), text.size());
    }
    copy[text.size()] = '\0';
    return new (place) StringObject(&arena, owner, copy, static_cast<std::uint32_t>(text.size()));
}

ArrayObject* newArray(Arena& arena, CMPICount size, CMPIType elementType, Ownership owner) {
    if (size > maximumArraySize) {
        throw Refusal{CMPI_RC_ERR_FAILED, "the array is too large"};
    }
    auto* elements = arena.makeArray<CMPIData>(size);
    for (CMPICount i = 0; i < size; ++i) {
        new (&elements[i]) CMPIData(nullData(elementType));
    }
    return arena.make<ArrayObject>(&arena, owner, elementType, size, elements);
}

ObjectPathObject* newObjectPath(Arena& arena, std::string_view nameSpace,
                                std::string_view className, Ownership owner) {
    auto* path = arena.make<ObjectPathObject>(&arena, owner);
    path->host = arena.name({}, nameHash({}));
    path->nameSpace = arena.name(nameSpace, nameHash(nameSpace));
    path->className = arena.name(className, nameHash(className));
    return path;
}

DateTimeObject* newDateTime(Arena& arena, std::string_view text, Ownership owner) {
    auto* made = arena.make<DateTimeObject>(&arena, owner);
    text.copy(made->text, sizeof made->text - 1);
    return made;
}

StringObject* copyOf(const StringObject& source, Arena& arena, Ownership owner, int) {
    return newString(arena, source.view(), owner);
}

DateTimeObject* copyOf(const DateTimeObject& source, Arena& arena, Ownership owner, int) {
    return newDateTime(arena, source.text, owner);
}

ArrayObject* copyOf(const ArrayObject& source, Arena& arena, Ownership owner, int depth) {
    checkDepth(depth);
    ArrayObject* copy = newArray(arena, source.size, source.elementType, owner);
    for (CMPICount i = 0; i < source.size; ++i) {
        copy->elements[i] = copyData(arena, source.elements[i], depth);
    }
    return copy;
}

ObjectPathObject* copyOf(const ObjectPathObject& source, Arena& arena, Ownership owner, int depth) {
    checkDepth(depth);
    ObjectPathObject* copy =
        newObjectPath(arena, source.nameSpace->view(), source.className->view(), owner);
    copy->host = arena.name(source.host->view(), nameHash(source.host->view()));
    copyEntries(copy->keys, source.keys, arena, depth);
    return copy;
}

InstanceObject* copyOf(const InstanceObject& source, Arena& arena, Ownership owner, int depth) {
    checkDepth(depth);
    auto* copy = arena.make<InstanceObject>(&arena, owner);
    copy->path = copyOf(*source.path, arena, Ownership::Contained, depth);
    copyEntries(copy->properties, source.properties, arena, depth);
    copyEntries(copy->hidden, source.hidden, arena, depth);
    copyNames(copy->filter, source.filter, arena);
    copyNames(copy->keyNames, source.keyNames, arena);
    copy->filtered = source.filtered;
    copy->keysKnown = source.keysKnown;
    copy->declared = source.declared;
    copy->broker = source.broker;
    return copy;
}

ArgsObject* copyOf(const ArgsObject& source, Arena& arena, Ownership owner, int depth) {
    auto* copy = arena.make<ArgsObject>(&arena, owner);
    copyEntries(copy->arguments, source.arguments, arena, depth);
    return copy;
}

ContextObject* copyOf(const ContextObject& source, Arena& arena, Ownership owner, int depth) {
    auto* copy = arena.make<ContextObject>(&arena, owner);
    copyEntries(copy->entries, source.entries, arena, depth);
    return copy;
}

EnumerationObject* copyOf(const EnumerationObject& source, Arena& arena, Ownership owner,
                          int depth) {
    ArrayObject* elements = copyOf(*source.elements, arena, Ownership::Contained, depth);
    auto* copy = arena.make<EnumerationObject>(&arena, owner, elements);
    copy->position = source.position;
    return copy;
}

ErrorObject* copyOf(const ErrorObject& source, Arena& arena, Ownership owner, int depth) {
    auto* copy = arena.make<ErrorObject>(&arena, owner);
    copy->errorType = source.errorType;
    copy->severity = source.severity;
    copy->probableCause = source.probableCause;
    copy->sourceFormat = source.sourceFormat;
    copy->statusCode = source.statusCode;
    copy->otherErrorType = partOf(source.otherErrorType, arena);
    copy->owningEntity = partOf(source.owningEntity, arena);
    copy->messageId = partOf(source.messageId, arena);
    copy->message = partOf(source.message, arena);
    copy->probableCauseDescription = partOf(source.probableCauseDescription, arena);
    copy->errorSource = partOf(source.errorSource, arena);
    copy->otherSourceFormat = partOf(source.otherSourceFormat, arena);
    copy->statusCodeDescription = partOf(source.statusCodeDescription, arena);
    const auto array = [&](const ArrayObject* part) {
        return part ? copyOf(*part, arena, Ownership::Contained, depth) : nullptr;
    };
    copy->recommendedActions = array(source.recommendedActions);
    copy->messageArguments = array(source.messageArguments);
    return copy;
}

} // namespace qelo::broker
