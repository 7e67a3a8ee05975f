#include "support/broker/Call.h"
#include "support/broker/DateTimeText.h"

#include <ctime>
#include <strings.h>

namespace qelo::test {

namespace {

CMPIInstance* newInstance(const CMPIBroker* mb, const CMPIObjectPath* path, CMPIStatus* st) {
    Call call("newInstance", mb, st);
    call.object(path);
    if (!call.begin()) {
        return call.noObject<CMPIInstance>();
    }
    InstanceContent content;
    content.data.path = Call::contentOf(path);
    return call.state().make<CMPIInstance>(std::move(content));
}

CMPIObjectPath* newObjectPath(const CMPIBroker* mb, const char* ns, const char* className,
                              CMPIStatus* st) {
    Call call("newObjectPath", mb, st);
    call.text(ns);
    call.text(className);
    if (!call.begin()) {
        return call.noObject<CMPIObjectPath>();
    }
    return call.state().make<CMPIObjectPath>({"", ns, className, {}});
}

CMPIArgs* newArgs(const CMPIBroker* mb, CMPIStatus* st) {
    Call call("newArgs", mb, st);
    return call.begin() ? call.state().make<CMPIArgs>({}) : call.noObject<CMPIArgs>();
}

CMPIString* newString(const CMPIBroker* mb, const char* text, CMPIStatus* st) {
    Call call("newString", mb, st);
    call.quoted(text);
    return call.begin() ? call.string(text) : call.noObject<CMPIString>();
}

CMPIArray* newArray(const CMPIBroker* mb, CMPICount size, CMPIType type, CMPIStatus* st) {
    Call call("newArray", mb, st);
    call.number(size);
    call.elementType(type);
    if (!call.begin()) {
        return call.noObject<CMPIArray>();
    }
    return call.state().make<CMPIArray>({type, std::vector<Value>(size, Value::nullOf(type))});
}

CMPIDateTime* newDateTime(const CMPIBroker* mb, CMPIStatus* st) {
    Call call("newDateTime", mb, st);
    if (!call.begin()) {
        return call.noObject<CMPIDateTime>();
    }
    const auto now = static_cast<std::uint64_t>(std::time(nullptr));
    return call.state().make<CMPIDateTime>({dateTimeTextOf(now * 1000000, false)});
}

CMPIDateTime* newDateTimeFromBinary(const CMPIBroker* mb, CMPIUint64 time, CMPIBoolean interval,
                                    CMPIStatus* st) {
    Call call("newDateTimeFromBinary", mb, st);
    call.number(time);
    call.number(interval);
    if (!call.begin()) {
        return call.noObject<CMPIDateTime>();
    }
    return call.state().make<CMPIDateTime>({dateTimeTextOf(time, interval != 0)});
}

CMPIDateTime* newDateTimeFromChars(const CMPIBroker* mb, const char* text, CMPIStatus* st) {
    Call call("newDateTimeFromChars", mb, st);
    call.quoted(text);
    if (!call.begin()) {
        return call.noObject<CMPIDateTime>();
    }
    if (isDateTimeText(text)) {
        return call.state().make<CMPIDateTime>({text});
    }
    call.fail(CMPI_RC_ERR_INVALID_PARAMETER);
    return nullptr;
}

CMPISelectExp* newSelectExp(const CMPIBroker* mb, const char* query, const char* lang,
                            CMPIArray** projection, CMPIStatus* st) {
    Call call("newSelectExp", mb, st);
    call.text(query);
    call.text(lang);
    if (projection != nullptr) {
        *projection = nullptr;
    }
    if (call.begin()) {
        call.fail(CMPI_RC_ERR_NOT_SUPPORTED);
    }
    return nullptr;
}

CMPIBoolean classPathIsA(const CMPIBroker* mb, const CMPIObjectPath* path, const char* className,
                         CMPIStatus* st) {
    Call call("classPathIsA", mb, st);
    call.object(path);
    call.text(className);
    if (!call.begin()) {
        return 0;
    }
    return strcasecmp(Call::contentOf(path).className.c_str(), className) == 0 ? 1 : 0;
}

// Any live object; NULL when it is none, which is a violation.
Object* anyObject(Call& call, const void* object) {
    Object* const known = BrokerState::objectAt(object);
    if (known != nullptr && known->life != Life::Ended && known->hasHandle()) {
        return known;
    }
    call.refuse(CMPI_RC_ERR_INVALID_HANDLE, "no live object as argument");
    return nullptr;
}

CMPIString* toString(const CMPIBroker* mb, const void* object, CMPIStatus* st) {
    Call call("broker.toString", mb, st);
    const Object* const known = anyObject(call, object);
    if (!call.begin()) {
        return call.noObject<CMPIString>();
    }
    if (known->kind == Kind::ObjectPath) {
        return call.string(Call::contentOf(static_cast<const CMPIObjectPath*>(object)).toString());
    }
    if (known->kind == Kind::Instance) {
        return call.string(
            Call::contentOf(static_cast<const CMPIInstance*>(object)).visible().toString());
    }
    return call.string(kindName(known->kind));
}

CMPIBoolean isOfType(const CMPIBroker* mb, const void* object, const char* type, CMPIStatus* st) {
    Call call("isOfType", mb, st);
    const Object* const known = anyObject(call, object);
    call.text(type);
    if (!call.begin()) {
        return 0;
    }
    return std::string_view(kindName(known->kind)) == type ? 1 : 0;
}

CMPIString* getType(const CMPIBroker* mb, const void* object, CMPIStatus* st) {
    Call call("getType", mb, st);
    const Object* const known = anyObject(call, object);
    return call.begin() ? call.string(kindName(known->kind)) : call.noObject<CMPIString>();
}

// The default text as it is.
CMPIString* untranslated(Call& call, const char* text) {
    if (!call.begin()) {
        return call.noObject<CMPIString>();
    }
    call.fail(CMPI_RC_ERR_NOT_SUPPORTED);
    return call.string(text);
}

CMPIString* getMessage(const CMPIBroker* mb, const char* msgId, const char* defMsg, CMPIStatus* st,
                       CMPICount, ...) {
    Call call("getMessage", mb, st);
    call.optional(msgId);
    call.text(defMsg);
    return untranslated(call, defMsg);
}

CMPIString* getMessage2(const CMPIBroker* mb, const char* msgId, const CMPIMsgFileHandle,
                        const char* defMsg, CMPIStatus* st, CMPICount, ...) {
    Call call("getMessage2", mb, st);
    call.optional(msgId);
    call.text(defMsg);
    return untranslated(call, defMsg);
}

// What logMessage and trace share; text wins over string.
CMPIStatus write(Call& call, std::vector<BrokerTrace> CallRecord::*list, int level,
                 const char* component, const char* text, const CMPIString* string) {
    call.number(static_cast<unsigned>(level));
    call.optional(component);
    if (text != nullptr || string == nullptr) {
        call.text(text);
    } else {
        call.object(string);
    }
    if (!call.begin()) {
        return call.status();
    }
    const std::string line = text != nullptr ? text : Call::contentOf(string);
    (call.state().current().*list).push_back({level, component == nullptr ? "" : component, line});
    if (call.state().refuseTraces) {
        call.fail(CMPI_RC_ERR_NOT_SUPPORTED);
    }
    return call.status();
}

CMPIStatus logMessage(const CMPIBroker* mb, CMPISeverity severity, const char* id, const char* text,
                      const CMPIString* string) {
    Call call("logMessage", mb);
    return write(call, &CallRecord::logs, severity, id, text, string);
}

CMPIStatus trace(const CMPIBroker* mb, CMPILevel level, const char* component, const char* text,
                 const CMPIString* string) {
    Call call("trace", mb);
    return write(call, &CallRecord::traces, level, component, text, string);
}

CMPIError* newCMPIError(const CMPIBroker* mb, const char* owner, const char* msgID, const char* msg,
                        const CMPIErrorSeverity, const CMPIErrorProbableCause, const CMPIrc,
                        CMPIStatus* st) {
    Call call("newCMPIError", mb, st);
    call.optional(owner);
    call.optional(msgID);
    call.optional(msg);
    if (call.begin()) {
        call.fail(CMPI_RC_ERR_NOT_SUPPORTED);
    }
    return nullptr;
}

CMPIStatus openMessageFile(const CMPIBroker* mb, const char* file, CMPIMsgFileHandle* handle) {
    Call call("openMessageFile", mb);
    call.text(file);
    if (handle == nullptr) {
        call.refuse(CMPI_RC_ERR_INVALID_PARAMETER, "NULL handle");
    } else {
        *handle = nullptr;
    }
    if (call.begin()) {
        call.fail(CMPI_RC_ERR_NOT_FOUND);
    }
    return call.status();
}

CMPIStatus closeMessageFile(const CMPIBroker* mb, const CMPIMsgFileHandle handle) {
    Call call("closeMessageFile", mb);
    if (handle != nullptr) {
        call.refuse(CMPI_RC_ERR_INVALID_HANDLE, "unknown message file");
    }
    call.begin();
    return call.status();
}

} // namespace

const CMPIBrokerEncFT* tableBrokerEnc() {
    static const CMPIBrokerEncFT table = {CMPIVersion200,
                                          newInstance,
                                          newObjectPath,
                                          newArgs,
                                          newString,
                                          newArray,
                                          newDateTime,
                                          newDateTimeFromBinary,
                                          newDateTimeFromChars,
                                          newSelectExp,
                                          classPathIsA,
                                          toString,
                                          isOfType,
                                          getType,
                                          getMessage,
                                          logMessage,
                                          trace,
                                          newCMPIError,
                                          openMessageFile,
                                          closeMessageFile,
                                          getMessage2};
    return &table;
}

} // namespace qelo::test
