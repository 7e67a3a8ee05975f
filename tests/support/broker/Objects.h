// The CMPI objects of the recording broker: a CMPI struct, what is in it, and how long it
// lives. Every object is known by its address, so that a slot can judge any pointer
// without following it.
#pragma once

#include "support/broker/Recorded.h"

#include <cmpift.h>

#include <memory>
#include <string>
#include <type_traits>
#include <vector>

namespace qelo::test {

class BrokerState;

enum class Kind {
    Broker,
    Context,
    Result,
    String,
    Array,
    Enumeration,
    Instance,
    ObjectPath,
    Args,
    DateTime
};

// "CMPIString"
const char* kindName(Kind kind);

enum class Life {
    Call,  // until the current call ends
    Test,  // until the broker is destroyed
    Clone, // until it is released
    Ended
};

struct Object {
    Object(Kind objectKind, Life objectLife, BrokerState& state)
        : kind(objectKind), life(objectLife), owner(&state) {}
    virtual ~Object() = default;
    Object(const Object&) = delete;
    Object& operator=(const Object&) = delete;

    // The address that a provider knows it by.
    virtual const void* address() const = 0;
    virtual bool hasHandle() const = 0;
    // Frees what is in it; the struct itself stays, for those who still use it.
    virtual void dropContent() = 0;

    Kind kind;
    Life life;
    BrokerState* owner;
    unsigned endedInCall = 0;
};

// ---- What is in the objects

struct ArrayContent {
    CMPIType elementType = CMPI_null;
    std::vector<Value> elements;
};

struct EnumerationContent {
    CMPIType elementType = CMPI_ref;
    std::vector<Value> elements;
    std::size_t next = 0;
};

struct InstanceContent {
    Instance data; // with all properties ever set
    bool filtered = false;
    std::vector<std::string> filter;

    bool admits(const std::string& name) const;
    // What a reader sees: without what the filter hides.
    Instance visible() const;
};

struct ArgsContent {
    std::vector<NamedValue> values;
};

struct ContextContent {
    std::vector<NamedValue> entries;
};

struct DateTimeContent {
    std::string text;
};

struct ResultContent {
    bool done = false;
};

template <typename Cmpi> struct Traits;

#define QELO_OBJECT_TRAITS(NAME, CONTENT)                                                          \
    const CMPI##NAME##FT* table##NAME();                                                           \
    template <> struct Traits<CMPI##NAME> {                                                        \
        using Content = CONTENT;                                                                   \
        static constexpr Kind kind = Kind::NAME;                                                   \
        static const CMPI##NAME##FT* table() { return table##NAME(); }                             \
    };

QELO_OBJECT_TRAITS(Context, ContextContent)
QELO_OBJECT_TRAITS(Result, ResultContent)
QELO_OBJECT_TRAITS(String, std::string)
QELO_OBJECT_TRAITS(Array, ArrayContent)
QELO_OBJECT_TRAITS(Enumeration, EnumerationContent)
QELO_OBJECT_TRAITS(Instance, InstanceContent)
QELO_OBJECT_TRAITS(ObjectPath, Path)
QELO_OBJECT_TRAITS(Args, ArgsContent)
QELO_OBJECT_TRAITS(DateTime, DateTimeContent)
#undef QELO_OBJECT_TRAITS

template <typename Cmpi> struct ObjectOf : Object {
    using Content = typename Traits<Cmpi>::Content;

    // A NULL content makes an object without a handle.
    ObjectOf(std::unique_ptr<Content> objectContent, Life objectLife, BrokerState& state)
        : Object(Traits<Cmpi>::kind, objectLife, state), content(std::move(objectContent)) {
        cmpi.hdl = handle();
        cmpi.ft = Traits<Cmpi>::table();
    }

    const void* address() const override { return &cmpi; }
    bool hasHandle() const override { return cmpi.hdl != nullptr; }
    // hdl keeps its value: a provider must not find out by it that the object has ended.
    void dropContent() override { content.reset(); }

    // Providers may read the text of a string at its handle.
    const void* handle() const {
        if constexpr (std::is_same_v<Cmpi, CMPIString>)
            return content == nullptr ? nullptr : content->c_str();
        else
            return content.get();
    }

    Cmpi cmpi;
    std::unique_ptr<Content> content;
};

struct BrokerObject : Object {
    explicit BrokerObject(BrokerState& state);
    const void* address() const override { return &cmpi; }
    bool hasHandle() const override { return true; }
    void dropContent() override {}
    CMPIBroker cmpi;
};

const CMPIBrokerFT* tableBroker();
const CMPIBrokerEncFT* tableBrokerEnc();
const CMPIBrokerExtFT* tableBrokerExt();

// Adds, or replaces the value of that name, ignoring case.
void put(std::vector<NamedValue>& values, const std::string& name, const Value& value);
// The value of that name, ignoring case; NULL if there is none.
const Value* find(const std::vector<NamedValue>& values, const std::string& name);

} // namespace qelo::test
