// A broker with a router that only records, for the tests of single slots: the test plays
// the provider, inside one call.
#pragma once

#include <broker/Broker.h>
#include <broker/Convert.h>
#include <broker/Frame.h>

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace qelo::broker::testing {

// Answers every up-call from what the test put into it and notes what was asked.
class RecordingRouter : public Router {
public:
    std::vector<std::string> calls;
    OperationContext context;
    cim::ObjectPath path;
    cim::Instance instance;
    client::PropertyList properties;
    client::AssociationFilter filter;
    client::Arguments arguments;
    cim::Value value;
    std::string text;

    std::vector<cim::ObjectPath> paths;
    std::vector<cim::Instance> instances;
    client::MethodResult methodResult;
    std::unique_ptr<client::CimError> failure;

    void enumerateInstanceNames(const OperationContext& ctx, const cim::ObjectPath& op,
                                const client::PathSink& sink) override {
        note("enumerateInstanceNames", ctx, op);
        deliver(sink);
    }
    void enumerateInstances(const OperationContext& ctx, const cim::ObjectPath& op,
                            const client::PropertyList& names,
                            const client::InstanceSink& sink) override {
        properties = names;
        note("enumerateInstances", ctx, op);
        deliver(sink);
    }
    cim::Instance getInstance(const OperationContext& ctx, const cim::ObjectPath& op,
                              const client::PropertyList& names) override {
        properties = names;
        note("getInstance", ctx, op);
        return instances.at(0);
    }
    cim::ObjectPath createInstance(const OperationContext& ctx, const cim::ObjectPath& op,
                                   const cim::Instance& wanted) override {
        instance = wanted;
        note("createInstance", ctx, op);
        return paths.at(0);
    }
    void modifyInstance(const OperationContext& ctx, const cim::ObjectPath& op,
                        const cim::Instance& changed, const client::PropertyList& names) override {
        instance = changed;
        properties = names;
        note("modifyInstance", ctx, op);
    }
    void deleteInstance(const OperationContext& ctx, const cim::ObjectPath& op) override {
        note("deleteInstance", ctx, op);
    }
    void execQuery(const OperationContext& ctx, const cim::ObjectPath& op, const std::string& query,
                   const std::string& language, const client::InstanceSink& sink) override {
        text = language + ": " + query;
        note("execQuery", ctx, op);
        deliver(sink);
    }
    void associators(const OperationContext& ctx, const cim::ObjectPath& op,
                     const client::AssociationFilter& wanted, const client::PropertyList& names,
                     const client::InstanceSink& sink) override {
        filter = wanted;
        properties = names;
        note("associators", ctx, op);
        deliver(sink);
    }
    void associatorNames(const OperationContext& ctx, const cim::ObjectPath& op,
                         const client::AssociationFilter& wanted,
                         const client::PathSink& sink) override {
        filter = wanted;
        note("associatorNames", ctx, op);
        deliver(sink);
    }
    void references(const OperationContext& ctx, const cim::ObjectPath& op,
                    const client::AssociationFilter& wanted, const client::PropertyList& names,
                    const client::InstanceSink& sink) override {
        filter = wanted;
        properties = names;
        note("references", ctx, op);
        deliver(sink);
    }
    void referenceNames(const OperationContext& ctx, const cim::ObjectPath& op,
                        const client::AssociationFilter& wanted,
                        const client::PathSink& sink) override {
        filter = wanted;
        note("referenceNames", ctx, op);
        deliver(sink);
    }
    client::MethodResult invokeMethod(const OperationContext& ctx, const cim::ObjectPath& op,
                                      const std::string& method,
                                      const client::Arguments& in) override {
        text = method;
        arguments = in;
        note("invokeMethod", ctx, op);
        return methodResult;
    }
    void setProperty(const OperationContext& ctx, const cim::ObjectPath& op,
                     const std::string& name, const cim::Value& wanted) override {
        text = name;
        value = wanted;
        note("setProperty", ctx, op);
    }
    cim::Value getProperty(const OperationContext& ctx, const cim::ObjectPath& op,
                           const std::string& name) override {
        text = name;
        note("getProperty", ctx, op);
        return value;
    }
    void deliverIndication(const OperationContext& ctx, const std::string& nameSpace,
                           const cim::Instance& indication) override {
        text = nameSpace;
        instance = indication;
        note("deliverIndication", ctx, {});
    }

private:
    void note(const char* operation, const OperationContext& ctx, const cim::ObjectPath& op) {
        calls.emplace_back(operation);
        context = ctx;
        path = op;
        if (failure) {
            throw client::CimError(*failure);
        }
    }
    void deliver(const client::PathSink& sink) const {
        for (const cim::ObjectPath& found : paths) {
            sink(found);
        }
    }
    void deliver(const client::InstanceSink& sink) const {
        for (const cim::Instance& found : instances) {
            sink(found);
        }
    }
};

class BrokerTest : public ::testing::Test {
protected:
    void TearDown() override { frame.reset(); }

    // Hooks are for the broker's constructor: set them before the first use of mb().
    BrokerHooks hooks;
    RecordingRouter router;
    std::unique_ptr<Broker> broker;
    std::unique_ptr<Frame> frame = std::make_unique<Frame>(Frame::Kind::Call);
    // Starts as a status that no slot answers, so that a status left unwritten shows.
    CMPIStatus st = unwritten();

    const CMPIBroker* mb() {
        if (!broker) {
            broker = std::make_unique<Broker>(router, hooks);
        }
        return broker->cmpi();
    }

    static CMPIStatus unwritten() {
        return {CMPI_RC_ERR_ALREADY_EXISTS, reinterpret_cast<CMPIString*>(0x10)};
    }

    // The code of the last slot, once.
    CMPIrc rc() {
        const CMPIrc code = st.rc;
        st = unwritten();
        return code;
    }

    // Ends the call and starts another: what belonged to it is gone.
    void nextCall() {
        frame.reset();
        frame = std::make_unique<Frame>(Frame::Kind::Call);
    }

    CMPIString* string(const char* text) { return mb()->eft->newString(mb(), text, nullptr); }
    CMPIObjectPath* path(const char* className = "TEST_Thing") {
        return mb()->eft->newObjectPath(mb(), "root/test", className, nullptr);
    }
    CMPIInstance* instance() { return mb()->eft->newInstance(mb(), path(), nullptr); }
    CMPIArgs* args() { return mb()->eft->newArgs(mb(), nullptr); }
    CMPIArray* array(CMPICount size, CMPIType type) {
        return mb()->eft->newArray(mb(), size, type, nullptr);
    }
    // As the dispatcher makes it.
    CMPIContext* context(const OperationContext& from = {}) {
        return &fromCim(currentArena(), from, Ownership::Contained)->cmpi;
    }
};

inline std::string text(const CMPIString* string) {
    return string ? string->ft->getCharPtr(string, nullptr) : "(null)";
}

inline const CMPIValue* chars(const char* text) { return reinterpret_cast<const CMPIValue*>(text); }

inline CMPIValue uint32Value(CMPIUint32 number) {
    CMPIValue value = {};
    value.uint32 = number;
    return value;
}

inline bool isNull(const CMPIData& data) { return (data.state & CMPI_nullValue) != 0; }

} // namespace qelo::broker::testing
