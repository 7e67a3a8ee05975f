// The broker's factories for encapsulated objects.
#include "Broker.h"
#include "Data.h"
#include "Describe.h"
#include "Frame.h"
#include "Instances.h"
#include "Messages.h"
#include "Slot.h"

#include <cim/DateTime.h>

namespace qelo::broker {
namespace {

constexpr CMPIUint64 microsecondsPerDay = 86'400'000'000ULL;
constexpr CMPIUint64 longestInterval = 100'000'000ULL * microsecondsPerDay;
constexpr CMPIUint64 endOfYear9999 = 253'402'300'800ULL * 1'000'000ULL;

CMPIInstance* makeInstance(const CMPIBroker* mb, const CMPIObjectPath* path, CMPIStatus* st) {
    return slot<CMPIInstance*>(st, nullptr, [&] {
        const Broker& broker = aliveBroker(mb);
        const ObjectPathObject& source = alive<ObjectPathObject>(path);
        return &newInstance(currentArena(), source, Ownership::Call, &broker)->cmpi;
    });
}

// Neither namespace nor class is looked up: a path may lead to another object manager.
CMPIObjectPath* makeObjectPath(const CMPIBroker* mb, const char* nameSpace, const char* className,
                               CMPIStatus* st) {
    return slot<CMPIObjectPath*>(st, nullptr, [&] {
        (void)aliveBroker(mb);
        if (!nameSpace) {
            throw Refusal{CMPI_RC_ERR_INVALID_NAMESPACE};
        }
        if (!className) {
            throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
        }
        return &newObjectPath(currentArena(), nameSpace, className, Ownership::Call)->cmpi;
    });
}

CMPIArgs* makeArgs(const CMPIBroker* mb, CMPIStatus* st) {
    return slot<CMPIArgs*>(st, nullptr, [&] {
        (void)aliveBroker(mb);
        Arena& arena = currentArena();
        return &arena.make<ArgsObject>(&arena, Ownership::Call)->cmpi;
    });
}

CMPIString* makeString(const CMPIBroker* mb, const char* text, CMPIStatus* st) {
    return slot<CMPIString*>(st, nullptr, [&] {
        (void)aliveBroker(mb);
        if (!text) {
            throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
        }
        return &newString(currentArena(), text, Ownership::Call)->cmpi;
    });
}

CMPIArray* makeArray(const CMPIBroker* mb, CMPICount size, CMPIType type, CMPIStatus* st) {
    return slot<CMPIArray*>(st, nullptr, [&] {
        (void)aliveBroker(mb);
        if (!isElementType(type)) {
            throw Refusal{CMPI_RC_ERR_INVALID_DATA_TYPE};
        }
        return &newArray(currentArena(), size, storedType(type), Ownership::Call)->cmpi;
    });
}

CMPIDateTime* dateTime(const cim::DateTime& time) {
    return &newDateTime(currentArena(), time.text(), Ownership::Call)->cmpi;
}

CMPIDateTime* makeDateTime(const CMPIBroker* mb, CMPIStatus* st) {
    return slot<CMPIDateTime*>(st, nullptr, [&] {
        (void)aliveBroker(mb);
        return dateTime(cim::DateTime::now());
    });
}

CMPIDateTime* makeDateTimeFromBinary(const CMPIBroker* mb, CMPIUint64 microseconds,
                                     CMPIBoolean interval, CMPIStatus* st) {
    return slot<CMPIDateTime*>(st, nullptr, [&] {
        (void)aliveBroker(mb);
        if (microseconds >= (interval ? longestInterval : endOfYear9999)) {
            throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
        }
        return dateTime(cim::DateTime::fromMicroseconds(microseconds, interval != 0));
    });
}

CMPIDateTime* makeDateTimeFromChars(const CMPIBroker* mb, const char* text, CMPIStatus* st) {
    bool refused = false;
    CMPIDateTime* made = slot<CMPIDateTime*>(st, nullptr, [&]() -> CMPIDateTime* {
        (void)aliveBroker(mb);
        const auto time = text ? cim::DateTime::parse(text) : std::nullopt;
        refused = !time;
        return refused ? nullptr : dateTime(*time);
    });
    // Not thrown as other refusals are: providers ask for the date of a text without knowing
    // whether there is one in it, and often there is none.
    if (refused && st) {
        *st = {CMPI_RC_ERR_INVALID_PARAMETER, nullptr};
    }
    return made;
}

// Queries are left to the providers; nothing here parses them.
CMPISelectExp* makeSelectExp(const CMPIBroker* mb, const char*, const char*, CMPIArray** projection,
                             CMPIStatus* st) {
    if (projection) {
        *projection = nullptr;
    }
    return slot<CMPISelectExp*>(st, nullptr, [&]() -> CMPISelectExp* {
        (void)aliveBroker(mb);
        throw Refusal{CMPI_RC_ERR_NOT_SUPPORTED};
    });
}

CMPIBoolean classPathIsA(const CMPIBroker* mb, const CMPIObjectPath* path, const char* className,
                         CMPIStatus* st) {
    return slot<CMPIBoolean>(st, 0, [&] {
        const Broker& broker = aliveBroker(mb);
        const ObjectPathObject& source = alive<ObjectPathObject>(path);
        const std::string super(givenName(className));
        const std::string nameSpace(source.nameSpace->view());
        const std::string sub(source.className->view());
        const auto& hasClass = broker.hooks().schema.hasClass;
        if (hasClass && !hasClass(nameSpace, sub)) {
            throw Refusal{CMPI_RC_ERR_NOT_FOUND};
        }
        return broker.isA(nameSpace, sub, super);
    });
}

CMPIString* callString(std::string_view text) {
    return &newString(currentArena(), text, Ownership::Call)->cmpi;
}

CMPIString* toString(const CMPIBroker* mb, const void* object, CMPIStatus* st) {
    return slot<CMPIString*>(st, nullptr, [&] {
        (void)aliveBroker(mb);
        return callString(describeObject(object));
    });
}

CMPIBoolean isOfType(const CMPIBroker* mb, const void* object, const char* type, CMPIStatus* st) {
    return slot<CMPIBoolean>(st, 0, [&] {
        (void)aliveBroker(mb);
        const std::string_view actual = objectTypeName(object);
        if (!type || !isObjectTypeName(type)) {
            throw Refusal{CMPI_RC_ERR_INVALID_PARAMETER};
        }
        return actual == type;
    });
}

CMPIString* getType(const CMPIBroker* mb, const void* object, CMPIStatus* st) {
    return slot<CMPIString*>(st, nullptr, [&] {
        (void)aliveBroker(mb);
        return callString(objectTypeName(object));
    });
}

std::string messageText(const char* text, const CMPIString* string) {
    if (text) {
        return text;
    }
    return string ? std::string(alive<StringObject>(string).view()) : std::string();
}

CMPIStatus logMessage(const CMPIBroker* mb, CMPISeverity severity, const char* id, const char* text,
                      const CMPIString* string) {
    return statusSlot([&] {
        aliveBroker(mb).log(static_cast<int>(severity), id ? id : "", messageText(text, string));
    });
}

CMPIStatus trace(const CMPIBroker* mb, CMPILevel level, const char* component, const char* text,
                 const CMPIString* string) {
    return statusSlot([&] {
        const Broker& broker = aliveBroker(mb);
        if (!broker.hooks().log.trace) {
            return;
        }
        broker.trace(static_cast<int>(level), component ? component : "",
                     messageText(text, string));
    });
}

CMPIError* makeError(const CMPIBroker* mb, const char* owner, const char* messageId,
                     const char* message, CMPIErrorSeverity severity, CMPIErrorProbableCause cause,
                     CMPIrc statusCode, CMPIStatus* st) {
    return slot<CMPIError*>(st, nullptr, [&] {
        (void)aliveBroker(mb);
        Arena& arena = currentArena();
        const auto text = [&](const char* given) {
            return given ? newString(arena, given, Ownership::Contained) : nullptr;
        };
        auto* error = arena.make<ErrorObject>(&arena, Ownership::Call);
        error->owningEntity = text(owner);
        error->messageId = text(messageId);
        error->message = text(message);
        error->severity = severity;
        error->probableCause = cause;
        error->statusCode = statusCode;
        return &error->cmpi;
    });
}

} // namespace

const CMPIBrokerEncFT encapsulationTable = {
    CMPIVersion200,
    makeInstance,
    makeObjectPath,
    makeArgs,
    makeString,
    makeArray,
    makeDateTime,
    makeDateTimeFromBinary,
    makeDateTimeFromChars,
    makeSelectExp,
    classPathIsA,
    toString,
    isOfType,
    getType,
    getMessage,
    logMessage,
    trace,
    makeError,
    openMessageFile,
    closeMessageFile,
    getMessage2,
};

} // namespace qelo::broker
