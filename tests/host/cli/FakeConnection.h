// An object manager made of what a test puts into it, which remembers what it was asked.
#pragma once

#include <client/Connection.h>

#include <exception>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace qelo::cli {

// The state of the fake; it outlives the connections that share it.
struct FakeManager {
    std::vector<cim::Instance> instances; // the answer to everything that lists
    client::MethodResult methodResult;
    cim::Class cimClass;                 // the answer to getClass
    std::vector<std::string> classNames; // and to enumerateClassNames
    std::exception_ptr failure;          // thrown behind the instances
    // What associatorNames finds instead, where it is set.
    std::function<std::vector<cim::ObjectPath>(const cim::ObjectPath&,
                                               const client::AssociationFilter&)>
        associated;

    // The last request.
    std::string operation;
    cim::ObjectPath path;
    client::PropertyList properties;
    client::AssociationFilter filter;
    std::string method;
    client::Arguments arguments;
    bool deep = false;
    int connections = 0;

    template <typename Error> void failWith(Error error) {
        failure = std::make_exception_ptr(error);
    }
};

class FakeConnection final : public client::Connection {
public:
    explicit FakeConnection(FakeManager& manager) : manager_(manager) { ++manager.connections; }

    void enumerateInstanceNames(const cim::ObjectPath& path,
                                const client::PathSink& sink) override {
        note("enumerateInstanceNames", path);
        deliverPaths(sink);
    }
    void enumerateInstances(const cim::ObjectPath& path, const client::PropertyList& properties,
                            const client::InstanceSink& sink) override {
        note("enumerateInstances", path, properties);
        deliver(sink);
    }
    cim::Instance getInstance(const cim::ObjectPath& path,
                              const client::PropertyList& properties) override {
        note("getInstance", path, properties);
        fail();
        return manager_.instances.at(0);
    }
    void associators(const cim::ObjectPath& path, const client::AssociationFilter& filter,
                     const client::PropertyList& properties,
                     const client::InstanceSink& sink) override {
        note("associators", path, properties, filter);
        deliver(sink);
    }
    void associatorNames(const cim::ObjectPath& path, const client::AssociationFilter& filter,
                         const client::PathSink& sink) override {
        note("associatorNames", path, {}, filter);
        if (!manager_.associated) {
            return deliverPaths(sink);
        }
        for (const cim::ObjectPath& found : manager_.associated(path, filter)) {
            sink(found);
        }
    }
    void references(const cim::ObjectPath& path, const client::AssociationFilter& filter,
                    const client::PropertyList& properties,
                    const client::InstanceSink& sink) override {
        note("references", path, properties, filter);
        deliver(sink);
    }
    void referenceNames(const cim::ObjectPath& path, const client::AssociationFilter& filter,
                        const client::PathSink& sink) override {
        note("referenceNames", path, {}, filter);
        deliverPaths(sink);
    }
    client::MethodResult invokeMethod(const cim::ObjectPath& path, const std::string& method,
                                      const client::Arguments& in) override {
        note("invokeMethod", path);
        manager_.method = method;
        manager_.arguments = in;
        fail();
        return manager_.methodResult;
    }
    cim::Class getClass(const cim::ObjectPath& path) override {
        note("getClass", path);
        fail();
        return manager_.cimClass;
    }
    void enumerateClassNames(const cim::ObjectPath& path, bool deep,
                             const client::NameSink& sink) override {
        note("enumerateClassNames", path);
        manager_.deep = deep;
        for (const std::string& name : manager_.classNames) {
            sink(name);
        }
        fail();
    }

private:
    void note(const char* operation, const cim::ObjectPath& path,
              const client::PropertyList& properties = {},
              const client::AssociationFilter& filter = {}) {
        manager_.operation = operation;
        manager_.path = path;
        manager_.properties = properties;
        manager_.filter = filter;
    }
    void fail() const {
        if (manager_.failure) {
            std::rethrow_exception(manager_.failure);
        }
    }
    void deliver(const client::InstanceSink& sink) const {
        for (const cim::Instance& instance : manager_.instances) {
            sink(instance);
        }
        fail();
    }
    void deliverPaths(const client::PathSink& sink) const {
        for (const cim::Instance& instance : manager_.instances) {
            sink(instance.path());
        }
        fail();
    }

    FakeManager& manager_;
};

} // namespace qelo::cli
