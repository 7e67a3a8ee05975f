// The order of what requests for services and capabilities do at the broker, in the store and
// in the log.
#include "ServiceFixture.h"

#include "support/operations/Events.h"

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::ElementsAreArray;

Events endOf(const std::string& className, const std::string& operation) {
    return joined({{"broker: returnDone"},
                   exitMarker(className + "Provider", className + "_" + operation),
                   {destructorLine(className + "ObjFactory", className + "Factory")}});
}

// ---- services ----

class ServiceOrder : public ServiceFixture {
protected:
    static void expectEnd(const std::string& operation) {
        EXPECT_THAT(eventsFromLast("broker: returnDone"),
                    ElementsAreArray(endOf("SimAccountManagementService", operation)));
    }

    static Events keysThrough(const std::string& slot) {
        const auto set = [&](const std::string& name, const std::string& text) {
            return "broker: " + slot + "(" + name + ",chars,\"" + text + "\")";
        };
        return joined(
            {{set("SystemCreationClassName", "ZANTH_ComputerSystem"), "platform: getSystemName()",
              set("SystemName", "host.example"), set("CreationClassName", serviceClass)},
             getterLines("SimAccountManagementService", "getName", "_name", serviceName("/a")),
             {set("Name", serviceName("/a"))}});
    }
};

TEST_F(ServiceOrder, The_factory_goes_after_CMReturnDone_and_the_exit_marker) {
    serve({"/a"});
    enumNames();
    expectEnd("EnumInstanceNames");
    enumInstances();
    expectEnd("EnumInstances");
    getInstance(serviceKeys("/a"));
    expectEnd("GetInstance");
    getInstance({{"SystemName", "host.example"}});
    expectEnd("GetInstance");
}

TEST_F(ServiceOrder, A_path_is_made_and_placed_and_gets_its_keys_one_after_the_other) {
    serve({"/a"});
    enumNames();
    EXPECT_THAT(eventsWithin("getAllSimAccountManagementServiceCMPIObjPaths"),
                ElementsAreArray(joined({placedPath(serviceClass), keysThrough("addKey")})));
}

TEST_F(ServiceOrder, An_instance_is_filtered_and_gets_its_keys_one_after_the_other) {
    serve({"/a"});
    enumInstances({{"None"}});
    EXPECT_THAT(eventsWithin("makeSimAccountManagementServiceInstance"),
                ElementsAreArray(
                    joined({placedPath(serviceClass),
                            {"broker: newInstance(root/cimv2:" + std::string(serviceClass) + ")",
                             "broker: setPropertyFilter({None},{SystemCreationClassName,SystemName,"
                             "CreationClassName,Name})"},
                            keysThrough("setProperty")})));
}

// ---- capabilities ----

class CapabilitiesOrder : public CapabilitiesFixture {
protected:
    static void expectEnd(const std::string& operation) {
        EXPECT_THAT(eventsFromLast("broker: returnDone"),
                    ElementsAreArray(endOf("SimAccountManagementCapabilities", operation)));
    }

    static std::string keyThrough(const std::string& slot) {
        return "broker: " + slot + "(InstanceID,chars,\"" + capabilitiesId("/a") + "\")";
    }
};

TEST_F(CapabilitiesOrder, The_factory_goes_after_CMReturnDone_and_the_exit_marker) {
    serve({"/a"});
    enumNames();
    expectEnd("EnumInstanceNames");
    enumInstances();
    expectEnd("EnumInstances");
    getInstance({{"InstanceID", capabilitiesId("/a")}});
    expectEnd("GetInstance");
    getInstance({{"Name", "other"}});
    expectEnd("GetInstance");
}

TEST_F(CapabilitiesOrder, A_path_is_made_placed_and_given_its_key) {
    serve({"/a"});
    enumNames();
    EXPECT_THAT(eventsWithin("getAllSimAccountManagementCapabilitiesCMPIObjPaths"),
                ElementsAreArray(joined({placedPath(capabilitiesClass), {keyThrough("addKey")}})));
}

TEST_F(CapabilitiesOrder, An_instance_is_filtered_and_then_given_its_key) {
    serve({"/a"});
    enumInstances({{"None"}});
    EXPECT_THAT(
        eventsWithin("makeSimAccountManagementCapabilitiesInstance"),
        ElementsAreArray(joined(
            {placedPath(capabilitiesClass),
             {"broker: newInstance(root/cimv2:" + std::string(capabilitiesClass) + ")",
              "broker: setPropertyFilter({None},{InstanceID})", keyThrough("setProperty")}})));
}

TEST_F(CapabilitiesOrder, The_selection_is_tested_once_and_then_before_each_node) {
    serve({"/a"});
    enumNames();
    EXPECT_THAT(platform_.storeCallTexts(),
                ElementsAre("Instrumentation()", "selectNode(40)", "operator bool()->1",
                            "operator bool()->1", "getPathToNode()->/a",
                            "convertPathToString(/a)->node:/a", "operator++()",
                            "operator bool()->0", "~Instrumentation()"));
}

TEST_F(CapabilitiesOrder, An_empty_selection_is_tested_once) {
    enumNames();
    EXPECT_THAT(platform_.storeCallTexts(),
                ElementsAre("Instrumentation()", "selectNode(40)", "operator bool()->0",
                            "~Instrumentation()"));
}

} // namespace
} // namespace qelo::test
