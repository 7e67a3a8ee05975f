// What every slot of every table does alike: turn failures into status codes, keep
// exceptions away from the provider, and test the object it is called on.
#pragma once

#include "Objects.h"

#include <cxxabi.h>
#include <memory>
#include <string>
#include <utility>

namespace qelo::broker {

// A slot's refusal. Thrown inside the broker only; slot() turns it into a status.
struct Refusal {
    CMPIrc code;
    std::string text = {};
};

// Call this first in a handler for everything. A thread that is being cancelled, or exits,
// unwinds through the handler with something that is no C++ exception and must go on.
inline void passForcedUnwind() {
    if (!abi::__cxa_current_exception_type()) {
        // cppcheck-suppress rethrowNoCurrentException
        throw;
    }
}

// The status for the exception that is being handled. The message, if any, belongs to the
// running call.
CMPIStatus currentFailure() noexcept;

// Runs the body of a slot. `st` may be null; `onFailure` is what a refused slot answers.
template <class Result, class Body> Result slot(CMPIStatus* st, Result onFailure, Body body) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    try {
        const Result result = static_cast<Result>(body());
        if (st) {
            *st = status;
        }
        return result;
    } catch (...) {
        passForcedUnwind();
        status = currentFailure();
    }
    if (st) {
        *st = status;
    }
    return onFailure;
}

// The same for slots that answer a status.
template <class Body> CMPIStatus statusSlot(Body body) {
    try {
        body();
    } catch (...) {
        passForcedUnwind();
        return currentFailure();
    }
    return {CMPI_RC_OK, nullptr};
}

// What a getter answers when it has nothing.
CMPIData absentData();

// The object, or Refusal with INVALID_HANDLE.
template <class T> T& alive(const typename T::Cmpi* cmpi) {
    T* object = liveObject<T>(cmpi);
    if (!object) {
        throw Refusal{CMPI_RC_ERR_INVALID_HANDLE};
    }
    return *object;
}

// A name that was given, or Refusal with INVALID_PARAMETER.
std::string_view givenName(const char* name);

// Ends an object: a clone is freed, an object of the running call is dead from now on, a
// part of something else stays as it is.
template <class T> void endObject(T& object) {
    if (object.ownership == Ownership::Call) {
        object.cmpi.hdl = nullptr;
    } else if (object.ownership == Ownership::Clone) {
        object.cmpi.hdl = nullptr;
        delete object.arena;
    }
}

template <class T> CMPIStatus releaseSlot(typename T::Cmpi* self) {
    return statusSlot([&] { endObject(alive<T>(self)); });
}

template <class T> typename T::Cmpi* cloneSlot(const typename T::Cmpi* self, CMPIStatus* st) {
    return slot<typename T::Cmpi*>(st, nullptr, [&] {
        constexpr std::size_t firstBlock = 256;
        const T& source = alive<T>(self);
        auto arena = std::make_unique<Arena>(firstBlock);
        T* copy = copyOf(source, *arena, Ownership::Clone);
        (void)arena.release(); // endObject() deletes it
        return &copy->cmpi;
    });
}

} // namespace qelo::broker
