// One call of a slot, from its arguments to its outcome. Every slot reads:
//
//     CMPIData getKey(const CMPIObjectPath* self, const char* name, CMPIStatus* st) {
//         Call call("getKey", self, st);
//         call.text(name);                        // the arguments, in order
//         if (!call.begin())                      // recorded; a fault or a misuse?
//             return call.noData();
//         ... the slot's work ...
//     }
#pragma once

#include "support/broker/BrokerState.h"

namespace qelo::test {

class Call {
public:
    // self is judged first: a NULL, unknown or ended object is a violation. st, if the slot
    // has one, is written at the latest when begin() returns false or the Call ends.
    template <typename Cmpi>
    Call(const char* slot, const Cmpi* self, CMPIStatus* st = nullptr)
        : Call(slot, self, Traits<Cmpi>::kind, st) {}
    Call(const char* slot, const CMPIBroker* self, CMPIStatus* st = nullptr)
        : Call(slot, self, Kind::Broker, st) {}
    ~Call();
    Call(const Call&) = delete;
    Call& operator=(const Call&) = delete;

    // ---- Arguments: each is judged and becomes part of the recorded line.
    void text(const char* text);   // NULL is a violation
    void quoted(const char* text); // the same, recorded in quotes
    void optional(const char* text);
    void list(const char** names); // NULL-terminated, or NULL
    void number(unsigned long long number);
    // A type of elements, without CMPI_ARRAY.
    void elementType(CMPIType type);
    template <typename Cmpi> void object(const Cmpi* argument) {
        object(argument, Traits<Cmpi>::kind);
    }
    Value value(const CMPIValue* value, CMPIType type);
    // The same without a line: for what is inside a value.
    template <typename Cmpi> ObjectOf<Cmpi>* checked(const Cmpi* argument) {
        return static_cast<ObjectOf<Cmpi>*>(check(argument, Traits<Cmpi>::kind, "argument"));
    }

    // false: the slot has failed already and must return an empty result.
    bool begin();

    // ---- The object called, and arguments that begin() found good
    template <typename Cmpi> typename Traits<Cmpi>::Content& content() {
        return *static_cast<ObjectOf<Cmpi>*>(self_)->content;
    }
    template <typename Cmpi> static typename Traits<Cmpi>::Content& contentOf(const Cmpi* object) {
        return *static_cast<ObjectOf<Cmpi>*>(BrokerState::objectAt(object))->content;
    }
    Object& self() { return *self_; }
    BrokerState& state() { return *state_; }

    // ---- Outcome
    void violate(const std::string& text);
    void fail(CMPIrc rc, const std::string& message = {});
    // A violation that makes the slot fail; the first one decides the code.
    void refuse(CMPIrc rc, const std::string& text);
    CMPIStatus status();

    // ---- Results
    template <typename Cmpi> Cmpi* noObject() {
        return nullHandleWanted_ ? state_->makeWithoutHandle<Cmpi>() : nullptr;
    }
    CMPIData noData(CMPIType type = CMPI_string);
    // For slots that also write a name; name may be NULL.
    CMPIData noDataAndName(CMPIString** name);
    CMPIString* string(const std::string& text) { return state_->make<CMPIString>(text); }
    CMPIData data(const Value& value, CMPIValueState extraState = 0);
    // The value of that name or at that position, or NO_SUCH_PROPERTY. name, unless it is
    // NULL, takes the name.
    CMPIData named(const std::vector<NamedValue>& values, const char* name,
                   CMPIValueState extraState = 0);
    CMPIData at(const std::vector<NamedValue>& values, CMPICount index, CMPIString** name,
                CMPIValueState extraState = 0);

private:
    Call(const char* slot, const void* self, Kind kind, CMPIStatus* st);
    Object* check(const void* object, Kind kind, const char* role);
    void object(const void* argument, Kind kind);
    void argument(const std::string& text);
    void meet(const Fault& fault);
    void write(CMPIrc rc, const std::string& message);

    std::lock_guard<std::recursive_mutex> lock_;
    const char* slot_;
    CMPIStatus* st_;
    Object* self_ = nullptr;
    BrokerState* state_ = nullptr;
    std::string arguments_;
    bool hasArguments_ = false;
    CMPIrc rc_ = CMPI_RC_OK;
    std::string message_;
    bool faulted_ = false;
    bool nullHandleWanted_ = false;
};

// release and clone are the same for all objects.
template <typename Cmpi> CMPIStatus releaseSlot(Cmpi* self) {
    Call call("release", self);
    if (!call.begin())
        return call.status();
    if (call.self().life == Life::Clone)
        BrokerState::endObject(call.self());
    else
        call.violate("release of an object that is no clone");
    return call.status();
}

template <typename Cmpi> Cmpi* cloneSlot(const Cmpi* self, CMPIStatus* st) {
    Call call("clone", self, st);
    if (!call.begin())
        return call.noObject<Cmpi>();
    return call.state().template make<Cmpi>(call.content<Cmpi>(), Life::Clone);
}

} // namespace qelo::test
