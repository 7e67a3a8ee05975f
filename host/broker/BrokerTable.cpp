// Up-calls: what a provider asks of the object manager. Each goes to the router with the
// caller's context; the answer becomes objects of the caller's call.
#include "Broker.h"
#include "Convert.h"
#include "Data.h"
#include "Frame.h"
#include "Slot.h"

namespace qelo::broker {
namespace {

// What this broker can do. Queries are not parsed and indications not delivered here.
constexpr unsigned int capabilities = static_cast<unsigned int>(CMPI_MB_BasicRead) |
                                      static_cast<unsigned int>(CMPI_MB_BasicWrite) |
                                      static_cast<unsigned int>(CMPI_MB_InstanceManipulation) |
                                      static_cast<unsigned int>(CMPI_MB_AssociationTraversal) |
                                      static_cast<unsigned int>(CMPI_MB_OSEncapsulationSupport) |
                                      static_cast<unsigned int>(CMPI_MB_Supports_MemEnhancements) |
                                      static_cast<unsigned int>(CMPI_MB_Supports_Extended_Error);

// The parts of an up-call that all have in common, checked.
struct UpCall {
    UpCall(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op)
        : broker(aliveBroker(mb)), router(broker.router()),
          context(toCim(alive<ContextObject>(ctx))), path(toCim(alive<ObjectPathObject>(op))),
          arena(currentArena()) {}

    const Broker& broker;
    Router& router;
    OperationContext context;
    cim::ObjectPath path;
    Arena& arena; // the caller's: the router opens frames of its own above it
};

std::string textOrEmpty(const char* text) { return text ? text : ""; }

// Collects what a router delivers and makes an enumeration of it.
class Collector {
public:
    explicit Collector(UpCall& call) : call_(call) {}

    client::PathSink pathSink() {
        return [this](const cim::ObjectPath& path) {
            CMPIData& data = add(CMPI_ref);
            data.value.ref = &fromCim(call_.arena, path, Ownership::Contained)->cmpi;
        };
    }

    client::InstanceSink instanceSink() {
        return [this](const cim::Instance& instance) {
            InstanceObject* made =
                fromCim(call_.arena, instance, Ownership::Contained, &call_.broker);
            add(CMPI_instance).value.inst = &made->cmpi;
        };
    }

    CMPIEnumeration* enumeration(CMPIType type) {
        Arena& arena = call_.arena;
        ArrayObject* array =
            newArray(arena, static_cast<CMPICount>(elements_.size()), type, Ownership::Contained);
        std::copy(elements_.begin(), elements_.end(), array->elements);
        return &arena.make<EnumerationObject>(&arena, Ownership::Call, array)->cmpi;
    }

private:
    CMPIData& add(CMPIType type) {
        CMPIData data = {};
        data.type = type;
        elements_.push_back(data);
        return elements_.back();
    }

    UpCall& call_;
    std::vector<CMPIData> elements_;
};

CMPIContext* prepareAttachThread(const CMPIBroker* mb, const CMPIContext* ctx) {
    return slot<CMPIContext*>(nullptr, nullptr, [&] {
        return &aliveBroker(mb).prepareContext(alive<ContextObject>(ctx))->cmpi;
    });
}

CMPIStatus attachThread(const CMPIBroker* mb, const CMPIContext* ctx) {
    return statusSlot([&] {
        (void)aliveBroker(mb);
        (void)alive<ContextObject>(ctx);
        attachFrame();
    });
}

CMPIStatus detachThread(const CMPIBroker* mb, const CMPIContext* ctx) {
    return statusSlot([&] {
        Broker& broker = aliveBroker(mb);
        (void)alive<ContextObject>(ctx);
        if (!detachFrame()) {
            throw Refusal{CMPI_RC_ERR_FAILED, "the thread is not attached"};
        }
        broker.dropPreparedContext(ctx);
    });
}

CMPIStatus deliverIndication(const CMPIBroker* mb, const CMPIContext* ctx, const char* nameSpace,
                             const CMPIInstance* indication) {
    return statusSlot([&] {
        Router& router = aliveBroker(mb).router();
        const OperationContext context = toCim(alive<ContextObject>(ctx));
        const InstanceObject& instance = alive<InstanceObject>(indication);
        if (!nameSpace) {
            throw Refusal{CMPI_RC_ERR_INVALID_NAMESPACE};
        }
        router.deliverIndication(context, nameSpace, toCim(instance));
    });
}

CMPIEnumeration* enumerateInstanceNames(const CMPIBroker* mb, const CMPIContext* ctx,
                                        const CMPIObjectPath* op, CMPIStatus* st) {
    return slot<CMPIEnumeration*>(st, nullptr, [&] {
        UpCall call(mb, ctx, op);
        Collector found(call);
        call.router.enumerateInstanceNames(call.context, call.path, found.pathSink());
        return found.enumeration(CMPI_ref);
    });
}

CMPIInstance* getInstance(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                          const char** properties, CMPIStatus* st) {
    return slot<CMPIInstance*>(st, nullptr, [&] {
        UpCall call(mb, ctx, op);
        const cim::Instance found =
            call.router.getInstance(call.context, call.path, propertyList(properties));
        return &fromCim(call.arena, found, Ownership::Call, &call.broker)->cmpi;
    });
}

CMPIObjectPath* createInstance(const CMPIBroker* mb, const CMPIContext* ctx,
                               const CMPIObjectPath* op, const CMPIInstance* inst, CMPIStatus* st) {
    return slot<CMPIObjectPath*>(st, nullptr, [&] {
        UpCall call(mb, ctx, op);
        const cim::Instance wanted = toCim(alive<InstanceObject>(inst));
        const cim::ObjectPath made = call.router.createInstance(call.context, call.path, wanted);
        return &fromCim(call.arena, made, Ownership::Call)->cmpi;
    });
}

CMPIStatus modifyInstance(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                          const CMPIInstance* inst, const char** properties) {
    return statusSlot([&] {
        UpCall call(mb, ctx, op);
        const cim::Instance changed = toCim(alive<InstanceObject>(inst));
        call.router.modifyInstance(call.context, call.path, changed, propertyList(properties));
    });
}

CMPIStatus deleteInstance(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op) {
    return statusSlot([&] {
        UpCall call(mb, ctx, op);
        call.router.deleteInstance(call.context, call.path);
    });
}

CMPIEnumeration* execQuery(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                           const char* query, const char* language, CMPIStatus* st) {
    return slot<CMPIEnumeration*>(st, nullptr, [&] {
        UpCall call(mb, ctx, op);
        if (!query) {
            throw Refusal{CMPI_RC_ERR_INVALID_QUERY};
        }
        if (!language) {
            throw Refusal{CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED};
        }
        Collector found(call);
        call.router.execQuery(call.context, call.path, query, language, found.instanceSink());
        return found.enumeration(CMPI_instance);
    });
}

CMPIEnumeration* enumerateInstances(const CMPIBroker* mb, const CMPIContext* ctx,
                                    const CMPIObjectPath* op, const char** properties,
                                    CMPIStatus* st) {
    return slot<CMPIEnumeration*>(st, nullptr, [&] {
        UpCall call(mb, ctx, op);
        Collector found(call);
        call.router.enumerateInstances(call.context, call.path, propertyList(properties),
                                       found.instanceSink());
        return found.enumeration(CMPI_instance);
    });
}

CMPIEnumeration* associators(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                             const char* assocClass, const char* resultClass, const char* role,
                             const char* resultRole, const char** properties, CMPIStatus* st) {
    return slot<CMPIEnumeration*>(st, nullptr, [&] {
        UpCall call(mb, ctx, op);
        Collector found(call);
        call.router.associators(call.context, call.path,
                                {textOrEmpty(assocClass), textOrEmpty(resultClass),
                                 textOrEmpty(role), textOrEmpty(resultRole)},
                                propertyList(properties), found.instanceSink());
        return found.enumeration(CMPI_instance);
    });
}

CMPIEnumeration* associatorNames(const CMPIBroker* mb, const CMPIContext* ctx,
                                 const CMPIObjectPath* op, const char* assocClass,
                                 const char* resultClass, const char* role, const char* resultRole,
                                 CMPIStatus* st) {
    return slot<CMPIEnumeration*>(st, nullptr, [&] {
        UpCall call(mb, ctx, op);
        Collector found(call);
        call.router.associatorNames(call.context, call.path,
                                    {textOrEmpty(assocClass), textOrEmpty(resultClass),
                                     textOrEmpty(role), textOrEmpty(resultRole)},
                                    found.pathSink());
        return found.enumeration(CMPI_ref);
    });
}

CMPIEnumeration* references(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                            const char* resultClass, const char* role, const char** properties,
                            CMPIStatus* st) {
    return slot<CMPIEnumeration*>(st, nullptr, [&] {
        UpCall call(mb, ctx, op);
        Collector found(call);
        call.router.references(call.context, call.path,
                               {{}, textOrEmpty(resultClass), textOrEmpty(role), {}},
                               propertyList(properties), found.instanceSink());
        return found.enumeration(CMPI_instance);
    });
}

CMPIEnumeration* referenceNames(const CMPIBroker* mb, const CMPIContext* ctx,
                                const CMPIObjectPath* op, const char* resultClass, const char* role,
                                CMPIStatus* st) {
    return slot<CMPIEnumeration*>(st, nullptr, [&] {
        UpCall call(mb, ctx, op);
        Collector found(call);
        call.router.referenceNames(call.context, call.path,
                                   {{}, textOrEmpty(resultClass), textOrEmpty(role), {}},
                                   found.pathSink());
        return found.enumeration(CMPI_ref);
    });
}

// A missing list of input arguments is an empty one; output arguments may be unwanted.
CMPIData invokeMethod(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                      const char* method, const CMPIArgs* in, CMPIArgs* out, CMPIStatus* st) {
    return slot(st, absentData(), [&] {
        UpCall call(mb, ctx, op);
        const std::string name(givenName(method));
        const client::Arguments given = in ? toCim(alive<ArgsObject>(in)) : client::Arguments();
        ArgsObject* filled = out ? &alive<ArgsObject>(out) : nullptr;
        const client::MethodResult result =
            call.router.invokeMethod(call.context, call.path, name, given);
        for (const auto& [outName, value] : result.out) {
            if (filled) {
                filled->arguments.set(*filled->arena, outName, fromCim(*filled->arena, value));
            }
        }
        return fromCim(call.arena, result.returnValue);
    });
}

CMPIStatus setProperty(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                       const char* name, const CMPIValue* value, CMPIType type) {
    return statusSlot([&] {
        UpCall call(mb, ctx, op);
        const std::string property(givenName(name));
        call.router.setProperty(call.context, call.path, property,
                                toCim(storeData(call.arena, value, type)));
    });
}

CMPIData getProperty(const CMPIBroker* mb, const CMPIContext* ctx, const CMPIObjectPath* op,
                     const char* name, CMPIStatus* st) {
    return slot(st, absentData(), [&] {
        UpCall call(mb, ctx, op);
        const std::string property(givenName(name));
        return fromCim(call.arena, call.router.getProperty(call.context, call.path, property));
    });
}

} // namespace

const CMPIBrokerFT brokerTable = {
    capabilities, CMPIVersion200,     "qelosim",         prepareAttachThread,
    attachThread, detachThread,       deliverIndication, enumerateInstanceNames,
    getInstance,  createInstance,     modifyInstance,    deleteInstance,
    execQuery,    enumerateInstances, associators,       associatorNames,
    references,   referenceNames,     invokeMethod,      setProperty,
    getProperty,
};

} // namespace qelo::broker
