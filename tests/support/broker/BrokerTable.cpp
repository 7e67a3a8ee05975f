#include "support/broker/Call.h"

namespace qelo::test {

namespace {

using Broker = const CMPIBroker*;
using Context = const CMPIContext*;
using PathPtr = const CMPIObjectPath*;

CMPIContext* prepareAttachThread(Broker mb, Context ctx) {
    Call call("prepareAttachThread", mb);
    call.object(ctx);
    if (!call.begin()) {
        return call.noObject<CMPIContext>();
    }
    return call.state().make<CMPIContext>(Call::contentOf(ctx));
}

CMPIStatus attachThread(Broker mb, Context ctx) {
    Call call("attachThread", mb);
    call.object(ctx);
    call.begin();
    return call.status();
}

CMPIStatus detachThread(Broker mb, Context ctx) {
    Call call("detachThread", mb);
    call.object(ctx);
    if (call.begin()) {
        BrokerState::endObject(*BrokerState::objectAt(ctx));
    }
    return call.status();
}

// ---- The two enumerations

// For an element that a test has made: its content, or a value of the shape it stands for.
template <typename Cmpi> Value elementValue(const Cmpi* element, CMPIType type) {
    if (element == nullptr) {
        return Value::missing(type);
    }
    const Object* const known = BrokerState::objectAt(element);
    if (known == nullptr || known->kind != Traits<Cmpi>::kind) {
        giveUp("an answer holds an object that no broker made");
    }
    if (!known->hasHandle()) {
        return Value::withoutHandle(type);
    }
    if (known->life == Life::Ended) {
        giveUp("an answer holds an object that has ended");
    }
    if constexpr (std::is_same_v<Cmpi, CMPIObjectPath>) {
        return Value::ref(Call::contentOf(element));
    } else {
        return Value::embedded(Call::contentOf(element).visible());
    }
}

// Removes the properties that were not asked for.
void applyFilter(Value& value, const char** properties) {
    if (properties == nullptr || value.instance == nullptr) {
        return;
    }
    InstanceContent content;
    content.data = *value.instance;
    content.filtered = true;
    for (; *properties != nullptr; ++properties) {
        content.filter.emplace_back(*properties);
    }
    value = Value::embedded(content.visible());
}

template <typename Cmpi>
CMPIEnumeration* enumerate(Call& call, const std::map<std::string, Answer<Cmpi>>& answers,
                           PathPtr path, const char** properties, CMPIType type) {
    EnumerationContent content;
    content.elementType = type;
    const auto found = answers.find(lowerCase(Call::contentOf(path).className));
    if (found != answers.end()) {
        const Answer<Cmpi>& answer = found->second;
        call.fail(answer.rc, answer.message);
        if (answer.nullEnumeration) {
            return nullptr;
        }
        for (const Cmpi* element : answer.elements) {
            content.elements.push_back(elementValue(element, type));
        }
    }
    if (!call.state().ignoreFilter) {
        for (Value& value : content.elements) {
            applyFilter(value, properties);
        }
    }
    return call.state().make<CMPIEnumeration>(std::move(content));
}

CMPIEnumeration* enumerateInstanceNames(Broker mb, Context ctx, PathPtr path, CMPIStatus* st) {
    Call call("enumerateInstanceNames", mb, st);
    call.object(ctx);
    call.object(path);
    if (!call.begin()) {
        return call.noObject<CMPIEnumeration>();
    }
    return enumerate(call, call.state().nameAnswers, path, nullptr, CMPI_ref);
}

CMPIEnumeration* enumerateInstances(Broker mb, Context ctx, PathPtr path, const char** properties,
                                    CMPIStatus* st) {
    Call call("enumerateInstances", mb, st);
    call.object(ctx);
    call.object(path);
    call.list(properties);
    if (!call.begin()) {
        return call.noObject<CMPIEnumeration>();
    }
    return enumerate(call, call.state().instanceAnswers, path, properties, CMPI_instance);
}

// ---- Services that this broker lacks

// Judges what all of them take.
struct Unsupported : Call {
    Unsupported(const char* slot, Broker mb, Context ctx, CMPIStatus* st = nullptr)
        : Call(slot, mb, st) {
        object(ctx);
    }
    Unsupported(const char* slot, Broker mb, Context ctx, PathPtr path, CMPIStatus* st = nullptr)
        : Unsupported(slot, mb, ctx, st) {
        object(path);
    }
    template <typename Cmpi> Cmpi* nothing() {
        if (begin()) {
            fail(CMPI_RC_ERR_NOT_SUPPORTED);
        }
        return noObject<Cmpi>();
    }
    CMPIStatus refusal() {
        if (begin()) {
            fail(CMPI_RC_ERR_NOT_SUPPORTED);
        }
        return status();
    }
    CMPIData noValue() {
        if (begin()) {
            fail(CMPI_RC_ERR_NOT_SUPPORTED);
        }
        return noData();
    }
};

CMPIStatus deliverIndication(Broker mb, Context ctx, const char* ns, const CMPIInstance* ind) {
    Unsupported call("deliverIndication", mb, ctx);
    call.text(ns);
    call.object(ind);
    return call.refusal();
}

CMPIInstance* getInstance(Broker mb, Context ctx, PathPtr path, const char** properties,
                          CMPIStatus* st) {
    Unsupported call("getInstance", mb, ctx, path, st);
    call.list(properties);
    return call.nothing<CMPIInstance>();
}

CMPIObjectPath* createInstance(Broker mb, Context ctx, PathPtr path, const CMPIInstance* instance,
                               CMPIStatus* st) {
    Unsupported call("createInstance", mb, ctx, path, st);
    call.object(instance);
    return call.nothing<CMPIObjectPath>();
}

CMPIStatus modifyInstance(Broker mb, Context ctx, PathPtr path, const CMPIInstance* instance,
                          const char** properties) {
    Unsupported call("modifyInstance", mb, ctx, path);
    call.object(instance);
    call.list(properties);
    return call.refusal();
}

CMPIStatus deleteInstance(Broker mb, Context ctx, PathPtr path) {
    return Unsupported("deleteInstance", mb, ctx, path).refusal();
}

CMPIEnumeration* execQuery(Broker mb, Context ctx, PathPtr path, const char* query,
                           const char* lang, CMPIStatus* st) {
    Unsupported call("execQuery", mb, ctx, path, st);
    call.text(query);
    call.text(lang);
    return call.nothing<CMPIEnumeration>();
}

CMPIEnumeration* associators(Broker mb, Context ctx, PathPtr path, const char* assocClass,
                             const char* resultClass, const char* role, const char* resultRole,
                             const char** properties, CMPIStatus* st) {
    Unsupported call("associators", mb, ctx, path, st);
    for (const char* filter : {assocClass, resultClass, role, resultRole}) {
        call.optional(filter);
    }
    call.list(properties);
    return call.nothing<CMPIEnumeration>();
}

CMPIEnumeration* associatorNames(Broker mb, Context ctx, PathPtr path, const char* assocClass,
                                 const char* resultClass, const char* role, const char* resultRole,
                                 CMPIStatus* st) {
    Unsupported call("associatorNames", mb, ctx, path, st);
    for (const char* filter : {assocClass, resultClass, role, resultRole}) {
        call.optional(filter);
    }
    return call.nothing<CMPIEnumeration>();
}

CMPIEnumeration* references(Broker mb, Context ctx, PathPtr path, const char* resultClass,
                            const char* role, const char** properties, CMPIStatus* st) {
    Unsupported call("references", mb, ctx, path, st);
    call.optional(resultClass);
    call.optional(role);
    call.list(properties);
    return call.nothing<CMPIEnumeration>();
}

CMPIEnumeration* referenceNames(Broker mb, Context ctx, PathPtr path, const char* resultClass,
                                const char* role, CMPIStatus* st) {
    Unsupported call("referenceNames", mb, ctx, path, st);
    call.optional(resultClass);
    call.optional(role);
    return call.nothing<CMPIEnumeration>();
}

CMPIData invokeMethod(Broker mb, Context ctx, PathPtr path, const char* method, const CMPIArgs* in,
                      CMPIArgs* out, CMPIStatus* st) {
    Unsupported call("invokeMethod", mb, ctx, path, st);
    call.text(method);
    call.object(in);
    call.object(out);
    return call.noValue();
}

CMPIStatus setProperty(Broker mb, Context ctx, PathPtr path, const char* name,
                       const CMPIValue* value, CMPIType type) {
    Unsupported call("broker.setProperty", mb, ctx, path);
    call.text(name);
    call.value(value, type);
    return call.refusal();
}

CMPIData getProperty(Broker mb, Context ctx, PathPtr path, const char* name, CMPIStatus* st) {
    Unsupported call("broker.getProperty", mb, ctx, path, st);
    call.text(name);
    return call.noValue();
}

} // namespace

const CMPIBrokerFT* tableBroker() {
    static const CMPIBrokerFT table = {CMPI_MB_BasicRead | CMPI_MB_OSEncapsulationSupport,
                                       CMPIVersion200,
                                       "recording broker",
                                       prepareAttachThread,
                                       attachThread,
                                       detachThread,
                                       deliverIndication,
                                       enumerateInstanceNames,
                                       getInstance,
                                       createInstance,
                                       modifyInstance,
                                       deleteInstance,
                                       execQuery,
                                       enumerateInstances,
                                       associators,
                                       associatorNames,
                                       references,
                                       referenceNames,
                                       invokeMethod,
                                       setProperty,
                                       getProperty};
    return &table;
}

} // namespace qelo::test
