// A dispatcher with the test providers registered.
#pragma once

#include <broker/Dispatcher.h>
#include <broker/LocalConnection.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace qelo::broker::testing {

class DispatcherTest : public ::testing::Test {
protected:
    static constexpr const char* nameSpace = "root/test";

    void SetUp() override { start(); }

    virtual DispatcherOptions options() {
        DispatcherOptions made;
        made.libraryDirectories = {"/nonexistent", QELO_TEST_PROVIDER_DIRECTORY};
        made.hooks.schema.isA = [](const std::string&, const std::string& sub,
                                   const std::string& super) {
            const bool thing = super == "TEST_Thing";
            const bool widget = super == "TEST_Widget" || thing;
            return (sub == "TEST_Widget" && thing) || (sub == "TEST_Gadget" && widget) ||
                   (sub == "TEST_Gizmo" && (super == "TEST_Gadget" || widget)) ||
                   (sub == "TEST_Pair" && super == "TEST_Link");
        };
        made.hooks.log.log = [this](int, const std::string& id, const std::string& line) {
            const std::lock_guard lock(logMutex_);
            log_.push_back(id + ": " + line);
        };
        return made;
    }

    void start() {
        dispatcher = std::make_shared<Dispatcher>(options());
        dispatcher->add({"TEST_Widget",
                         {nameSpace, "root/second"},
                         "Widget",
                         "testwidgets",
                         {ProviderType::Instance, ProviderType::Method, ProviderType::Indication}});
        dispatcher->add(
            {"TEST_Widget", {nameSpace}, "Level", "testwidgets", {ProviderType::Property}});
        dispatcher->add(
            {"TEST_Gadget", {nameSpace}, "Gadget", "testwidgets", {ProviderType::Instance}});
        dispatcher->add(
            {"TEST_Pair", {nameSpace}, "Pair", "testwidgets", {ProviderType::Association}});
        dispatcher->add({"TEST_Plain",
                         {nameSpace},
                         "Plain",
                         "testplain",
                         {ProviderType::Instance, ProviderType::Method}});
        connection = std::make_unique<LocalConnection>(
            dispatcher, OperationContext{"alice", "admin", "de", "", 0});
    }

    // Registers one more instance provider.
    void add(const char* className, const char* provider, const char* library) {
        dispatcher->add({className, {nameSpace}, provider, library, {ProviderType::Instance}});
    }

    static cim::ObjectPath classPath(const char* className) { return {nameSpace, className}; }
    static cim::ObjectPath widget(const char* name) {
        cim::ObjectPath path(nameSpace, "TEST_Widget");
        path.setKey("Name", cim::Value::string(name));
        return path;
    }

    std::vector<std::string> names(const char* className) {
        std::vector<std::string> found;
        connection->enumerateInstanceNames(classPath(className), [&](const cim::ObjectPath& path) {
            found.push_back(path.toText());
        });
        return found;
    }
    std::vector<cim::Instance> instances(const char* className,
                                         const client::PropertyList& properties = {}) {
        std::vector<cim::Instance> found;
        connection->enumerateInstances(
            classPath(className), properties,
            [&](const cim::Instance& instance) { found.push_back(instance); });
        return found;
    }
    client::MethodResult invoke(const char* method, const client::Arguments& in = {}) {
        return connection->invokeMethod(widget("one"), method, in);
    }

    // The error that an operation ends with; code 0 when it succeeds.
    template <class Operation> client::CimError errorOf(Operation operation) {
        try {
            operation();
        } catch (const client::CimError& error) {
            return error;
        }
        return {0, "no error"};
    }

    std::vector<std::string> log() {
        const std::lock_guard lock(logMutex_);
        return log_;
    }

private:
    std::mutex logMutex_;
    std::vector<std::string> log_;

protected:
    // Last, so that clean-ups can still write to the log.
    std::shared_ptr<Dispatcher> dispatcher;
    std::unique_ptr<LocalConnection> connection;
};

} // namespace qelo::broker::testing
