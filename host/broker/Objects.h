// The broker's side of the encapsulated CMPI types. What a provider sees of each is the
// handle and the table in front; the rest follows in the same piece of arena memory.
//
// Nothing here is locked: as CMPI has it, one object is used by one thread at a time.
#pragma once

#include "Arena.h"
#include "Names.h"

#include <cmpi/cmpift.h>

#include <cstdint>
#include <string_view>

namespace qelo::broker {

class Broker;
class DeclaredClass;
struct DeclaredProperty;

enum class Ownership : std::uint8_t {
    Call,      // made by a factory or an up-call: ends with the call, or early when released
    Contained, // part of another object, or an argument: releasing it changes nothing
    Clone,     // belongs to the provider, and its arena with it
};

// Deeper nesting of values inside values is refused, so that no recursion over them can
// exhaust the stack.
constexpr int maximumDepth = 32;

// Cmpi: the struct that providers see; its hdl is null once the object is dead.
template <class CmpiType, class TableType> struct Object {
    using Cmpi = CmpiType;
    using Table = TableType;

    Object(const Table& ft, Arena* home, Ownership owner)
        : cmpi{this, &ft}, arena(home), ownership(owner) {}

    Cmpi cmpi;
    Arena* arena; // where the object and all its parts lie
    Ownership ownership;
};

// Its hdl is the text itself: some providers read it there.
struct StringObject : Object<CMPIString, CMPIStringFT> {
    StringObject(Arena* home, Ownership owner, const char* text, std::uint32_t size)
        : Object(table, home, owner), length(size) {
        cmpi.hdl = text;
    }
    const char* text() const { return static_cast<const char*>(cmpi.hdl); }
    std::string_view view() const { return {text(), length}; }

    std::uint32_t length;
    static const Table table;
    static constexpr const char* typeName = "CMPIString";
};

struct DateTimeObject : Object<CMPIDateTime, CMPIDateTimeFT> {
    DateTimeObject(Arena* home, Ownership owner) : Object(table, home, owner) {}

    char text[26] = {}; // the 25 characters and the final zero
    static const Table table;
    static constexpr const char* typeName = "CMPIDateTime";
};

struct ArrayObject : Object<CMPIArray, CMPIArrayFT> {
    ArrayObject(Arena* home, Ownership owner, CMPIType type, CMPICount count, CMPIData* data)
        : Object(table, home, owner), elementType(type), size(count), elements(data) {}

    CMPIType elementType;
    CMPICount size;
    CMPIData* elements;
    static const Table table;
    static constexpr const char* typeName = "CMPIArray";
};

// One named value: a property, a key, an argument, a context entry.
struct Entry {
    StringObject* name;
    std::uint32_t hash;
    CMPIData data;
    StringObject* origin; // the class a property comes from, or null
};

// How a new entry is called.
struct EntryName {
    std::string_view text;
    std::uint32_t hash;
    StringObject* object; // that text where it lives as long as the list, or null
};

class EntryList {
public:
    std::size_t size() const { return entries_.size(); }
    Entry& operator[](std::size_t index) { return entries_[index]; }
    const Entry& operator[](std::size_t index) const { return entries_[index]; }
    const Entry* begin() const { return entries_.begin(); }
    const Entry* end() const { return entries_.end(); }

    // The entry of that name, or null.
    Entry* find(std::string_view name, std::uint32_t hash);
    const Entry* find(std::string_view name) const;

    // Adds, or replaces under the same name.
    void set(Arena& arena, std::string_view name, const CMPIData& data) {
        set(arena, name, nameHash(name), data, nullptr);
    }
    void set(Arena& arena, std::string_view name, std::uint32_t hash, const CMPIData& data,
             StringObject* origin) {
        set(arena, EntryName{name, hash, nullptr}, data, origin);
    }
    void set(Arena& arena, const EntryName& name, const CMPIData& data, StringObject* origin);
    // Whoever appends knows that there is none of that name.
    void append(Arena& arena, const Entry& entry) {
        entries_.append(arena, entry);
        hashes_ |= bitOf(entry.hash);
    }
    void reserve(Arena& arena, std::size_t count) { entries_.reserve(arena, count); }
    void clear() {
        entries_.clear();
        hashes_ = 0;
    }

private:
    static std::uint64_t bitOf(std::uint32_t hash) { return std::uint64_t{1} << (hash % 64); }

    ArenaVector<Entry> entries_;
    std::uint64_t hashes_ = 0; // a bit for each hash that is there: most others need no search
};

struct ObjectPathObject : Object<CMPIObjectPath, CMPIObjectPathFT> {
    ObjectPathObject(Arena* home, Ownership owner) : Object(table, home, owner) {}

    StringObject* host = nullptr; // none of the three is null once the path is made
    StringObject* nameSpace = nullptr;
    StringObject* className = nullptr;
    EntryList keys;
    static const Table table;
    static constexpr const char* typeName = "CMPIObjectPath";
};

// A set of names, kept for membership tests.
class NameSet {
public:
    void add(Arena& arena, std::string_view name);
    bool has(std::string_view name, std::uint32_t hash) const;
    bool empty() const { return names_.empty(); }
    void clear() {
        names_.clear();
        hashes_.clear();
    }
    const StringObject* const* begin() const { return names_.begin(); }
    const StringObject* const* end() const { return names_.end(); }

private:
    ArenaVector<const StringObject*> names_;
    ArenaVector<std::uint32_t> hashes_;
};

struct InstanceObject : Object<CMPIInstance, CMPIInstanceFT> {
    InstanceObject(Arena* home, Ownership owner) : Object(table, home, owner) {}

    ObjectPathObject* path = nullptr;
    EntryList properties;
    EntryList hidden; // set before a filter that leaves them out
    bool filtered = false;
    NameSet filter;
    NameSet keyNames;       // properties that are keys, from the schema or the provider
    bool keysKnown = false; // the schema names the keys of the class
    const DeclaredClass* declared = nullptr; // null: the schema does not know the class
    const DeclaredProperty* lastSet = nullptr;
    const Broker* broker = nullptr;
    static const Table table;
    static constexpr const char* typeName = "CMPIInstance";
};

struct ArgsObject : Object<CMPIArgs, CMPIArgsFT> {
    ArgsObject(Arena* home, Ownership owner) : Object(table, home, owner) {}

    EntryList arguments;
    static const Table table;
    static constexpr const char* typeName = "CMPIArgs";
};

struct ContextObject : Object<CMPIContext, CMPIContextFT> {
    ContextObject(Arena* home, Ownership owner) : Object(table, home, owner) {}

    EntryList entries;
    static const Table table;
    static constexpr const char* typeName = "CMPIContext";
};

struct EnumerationObject : Object<CMPIEnumeration, CMPIEnumerationFT> {
    EnumerationObject(Arena* home, Ownership owner, ArrayObject* all)
        : Object(table, home, owner), elements(all) {}

    ArrayObject* elements;
    CMPICount position = 0;
    static const Table table;
    static constexpr const char* typeName = "CMPIEnumeration";
};

struct ErrorObject : Object<CMPIError, CMPIErrorFT> {
    ErrorObject(Arena* home, Ownership owner) : Object(table, home, owner) {}

    CMPIErrorType errorType = UnknownErrorType;
    CMPIErrorSeverity severity = ErrorSevUnknown;
    CMPIErrorProbableCause probableCause = ErrorProbCauseUnknown;
    CMPIErrorSrcFormat sourceFormat = CMPIErrSrcUnknown;
    CMPIrc statusCode = CMPI_RC_OK;
    StringObject* otherErrorType = nullptr; // null: not set, as for all that follow
    StringObject* owningEntity = nullptr;
    StringObject* messageId = nullptr;
    StringObject* message = nullptr;
    StringObject* probableCauseDescription = nullptr;
    StringObject* errorSource = nullptr;
    StringObject* otherSourceFormat = nullptr;
    StringObject* statusCodeDescription = nullptr;
    ArrayObject* recommendedActions = nullptr;
    ArrayObject* messageArguments = nullptr;
    static const Table table;
    static constexpr const char* typeName = "CMPIError";
};

// The object behind what a provider passed, or null when it is null, dead or not the
// broker's own.
template <class T> T* liveObject(const typename T::Cmpi* cmpi) {
    if (!cmpi || !cmpi->hdl || cmpi->ft != &T::table) {
        return nullptr;
    }
    using Base = Object<typename T::Cmpi, typename T::Table>;
    auto* base = reinterpret_cast<Base*>(const_cast<typename T::Cmpi*>(cmpi));
    return static_cast<T*>(base);
}

// Makers. Each puts the new object and all its parts into `arena`.
StringObject* newString(Arena& arena, std::string_view text, Ownership owner);
ArrayObject* newArray(Arena& arena, CMPICount size, CMPIType elementType, Ownership owner);
ObjectPathObject* newObjectPath(Arena& arena, std::string_view nameSpace,
                                std::string_view className, Ownership owner);
// `text` must be a valid CIM datetime.
DateTimeObject* newDateTime(Arena& arena, std::string_view text, Ownership owner);

// Deep copies; a nesting deeper than maximumDepth is refused (Refusal, FAILED).
StringObject* copyOf(const StringObject& source, Arena& arena, Ownership owner, int depth = 0);
DateTimeObject* copyOf(const DateTimeObject& source, Arena& arena, Ownership owner, int depth = 0);
ArrayObject* copyOf(const ArrayObject& source, Arena& arena, Ownership owner, int depth = 0);
ObjectPathObject* copyOf(const ObjectPathObject& source, Arena& arena, Ownership owner,
                         int depth = 0);
InstanceObject* copyOf(const InstanceObject& source, Arena& arena, Ownership owner, int depth = 0);
ArgsObject* copyOf(const ArgsObject& source, Arena& arena, Ownership owner, int depth = 0);
ContextObject* copyOf(const ContextObject& source, Arena& arena, Ownership owner, int depth = 0);
EnumerationObject* copyOf(const EnumerationObject& source, Arena& arena, Ownership owner,
                          int depth = 0);
ErrorObject* copyOf(const ErrorObject& source, Arena& arena, Ownership owner, int depth = 0);

} // namespace qelo::broker
