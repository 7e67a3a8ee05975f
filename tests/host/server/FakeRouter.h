// A router that serves numbered things from memory and notes what it was asked.
#pragma once

#include <broker/Router.h>

#include <atomic>
#include <functional>
#include <mutex>
#include <string>
#include <vector>

namespace qelo::server {

// A function that a test may exchange while the server calls it.
class Hook {
public:
    using Function = std::function<void(std::size_t index)>;

    Hook& operator=(Function function) {
        const std::lock_guard<std::mutex> lock(mutex_);
        function_ = std::move(function);
        return *this;
    }
    void operator()(std::size_t index) const {
        Function function;
        {
            const std::lock_guard<std::mutex> lock(mutex_);
            function = function_;
        }
        if (function) {
            function(index);
        }
    }

private:
    mutable std::mutex mutex_;
    Function function_;
};

class FakeRouter final : public broker::Router {
public:
    using Context = broker::OperationContext;

    // What there is: instances of TEST_Thing with the keys "0", "1" ...
    std::atomic<std::size_t> count{3};
    std::size_t textSize = 10; // of each one's property Text
    // Called before each result; may throw or wait.
    Hook beforeResult;

    // What was asked, one line each.
    std::vector<std::string> asked() const {
        const std::lock_guard<std::mutex> lock(mutex_);
        return asked_;
    }
    client::PropertyList lastProperties;
    client::Arguments lastArguments;
    Context lastContext;

    static cim::ObjectPath path(std::size_t index) {
        cim::ObjectPath result("root/test", "TEST_Thing");
        result.setKey("Id", cim::Value::string(std::to_string(index)));
        return result;
    }
    cim::Instance instance(std::size_t index) const {
        cim::Instance result(path(index));
        result.setProperty("Id", cim::Value::string(std::to_string(index)));
        result.setProperty("Text", cim::Value::string(std::string(textSize, 'x')));
        result.setProperty("Size", cim::Value::null(cim::Type::UInt16));
        return result;
    }

    void enumerateInstanceNames(const Context& context, const cim::ObjectPath& classPath,
                                const client::PathSink& sink) override {
        note(context, "EnumerateInstanceNames " + classPath.toText());
        paths(sink);
    }
    void enumerateInstances(const Context& context, const cim::ObjectPath& classPath,
                            const client::PropertyList& properties,
                            const client::InstanceSink& sink) override {
        note(context, "EnumerateInstances " + classPath.toText(), properties);
        instances(sink);
    }
    cim::Instance getInstance(const Context& context, const cim::ObjectPath& path,
                              const client::PropertyList& properties) override {
        note(context, "GetInstance " + path.toText(), properties);
        for (std::size_t i = 0; i < count; ++i) {
            if (path == FakeRouter::path(i)) {
                return instance(i);
            }
        }
        throw client::CimError(6, "no such thing");
    }
    cim::ObjectPath createInstance(const Context& context, const cim::ObjectPath& classPath,
                                   const cim::Instance& made) override {
        note(context, "CreateInstance " + classPath.toText());
        return made.path().keys().empty() ? path(count) : made.path();
    }
    void modifyInstance(const Context& context, const cim::ObjectPath& path, const cim::Instance&,
                        const client::PropertyList& properties) override {
        note(context, "ModifyInstance " + path.toText(), properties);
    }
    void deleteInstance(const Context& context, const cim::ObjectPath& path) override {
        note(context, "DeleteInstance " + path.toText());
    }
    void execQuery(const Context& context, const cim::ObjectPath& classPath,
                   const std::string& query, const std::string& language,
                   const client::InstanceSink& sink) override {
        note(context, "ExecQuery " + classPath.toText() + " " + language + " " + query);
        instances(sink);
    }
    void associators(const Context& context, const cim::ObjectPath& path,
                     const client::AssociationFilter& filter,
                     const client::PropertyList& properties,
                     const client::InstanceSink& sink) override {
        note(context, "Associators " + path.toText() + filterText(filter), properties);
        instances(sink);
    }
    void associatorNames(const Context& context, const cim::ObjectPath& path,
                         const client::AssociationFilter& filter,
                         const client::PathSink& sink) override {
        note(context, "AssociatorNames " + path.toText() + filterText(filter));
        paths(sink);
    }
    void references(const Context& context, const cim::ObjectPath& path,
                    const client::AssociationFilter& filter, const client::PropertyList& properties,
                    const client::InstanceSink& sink) override {
        note(context, "References " + path.toText() + filterText(filter), properties);
        instances(sink);
    }
    void referenceNames(const Context& context, const cim::ObjectPath& path,
                        const client::AssociationFilter& filter,
                        const client::PathSink& sink) override {
        note(context, "ReferenceNames " + path.toText() + filterText(filter));
        paths(sink);
    }
    client::MethodResult invokeMethod(const Context& context, const cim::ObjectPath& path,
                                      const std::string& method,
                                      const client::Arguments& in) override {
        note(context, "InvokeMethod " + path.toText() + " " + method);
        lastArguments = in;
        return {cim::Value::unsignedInteger(cim::Type::UInt32, 42),
                {{"Answer", cim::Value::string("forty-two")}}};
    }
    void setProperty(const Context& context, const cim::ObjectPath& path, const std::string& name,
                     const cim::Value& value) override {
        note(context, "SetProperty " + path.toText() + " " + name + "=" + value.toText());
    }
    cim::Value getProperty(const Context& context, const cim::ObjectPath& path,
                           const std::string& name) override {
        note(context, "GetProperty " + path.toText() + " " + name);
        return cim::Value::unsignedInteger(cim::Type::UInt16, 7);
    }
    void deliverIndication(const Context&, const std::string&, const cim::Instance&) override {}

private:
    static std::string filterText(const client::AssociationFilter& filter) {
        return " [" + filter.assocClass + "," + filter.resultClass + "," + filter.role + "," +
               filter.resultRole + "]";
    }
    void note(const Context& context, const std::string& line,
              const client::PropertyList& properties = std::nullopt) {
        const std::lock_guard<std::mutex> lock(mutex_);
        asked_.push_back(line);
        lastContext = context;
        lastProperties = properties;
    }
    void paths(const client::PathSink& sink) const {
        for (std::size_t i = 0; i < count; ++i) {
            beforeResult(i);
            sink(path(i));
        }
    }
    void instances(const client::InstanceSink& sink) const {
        for (std::size_t i = 0; i < count; ++i) {
            beforeResult(i);
            sink(instance(i));
        }
    }
    mutable std::mutex mutex_;
    std::vector<std::string> asked_;
};

} // namespace qelo::server
