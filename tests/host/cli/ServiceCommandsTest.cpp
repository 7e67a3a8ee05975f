#include "Program.h"

#include <nlohmann/json.hpp>

namespace qelo::cli {
namespace {

using cim::Type;
using cim::Value;

cim::ObjectPath named(const std::string& className, const std::string& name) {
    cim::ObjectPath path("root/cimv2", className);
    path.setKey(className == "ZANTH_AccountManagementCapabilities" ? "InstanceID" : "Name",
                Value::string(name));
    return path;
}

cim::Instance service(const std::string& name) {
    cim::Instance instance(named("ZANTH_AccountManagementService", name));
    instance.setProperty("Name", Value::string(name));
    instance.setProperty("SystemName", Value::string("host"));
    instance.setProperty("EnabledState", Value::unsignedInteger(Type::UInt16, 5));
    return instance;
}

class ServiceCommands : public Program {};

TEST_F(ServiceCommands, Services_are_listed_as_a_table) {
    manager.instances = {service("accounts")};
    EXPECT_EQ(run({"service"}), 0) << errors.text();
    EXPECT_EQ(output.text(), "NAME      SYSTEM  ENABLED STATE  REQUESTED STATE\n"
                             "accounts  host                5                -\n"
                             "\n"
                             "1 service\n");
    EXPECT_EQ(manager.path.className(), "ZANTH_AccountManagementService");
    EXPECT_EQ(manager.properties,
              (std::vector<std::string>{"Name", "SystemName", "EnabledState", "RequestedState"}));
}

TEST_F(ServiceCommands, No_services_are_counted_too) {
    EXPECT_EQ(run({"service"}), 0);
    EXPECT_EQ(output.text(), "0 services\n");
}

TEST_F(ServiceCommands, Capabilities_are_listed_as_a_table) {
    cim::Instance capabilities(named("ZANTH_AccountManagementCapabilities", "caps"));
    capabilities.setProperty("InstanceID", Value::string("caps"));
    capabilities.setProperty("OperationsSupported",
                             Value::array(Type::UInt16, {Value::unsignedInteger(Type::UInt16, 2),
                                                         Value::unsignedInteger(Type::UInt16, 3)}));
    manager.instances = {capabilities, capabilities};
    EXPECT_EQ(run({"capabilities"}), 0) << errors.text();
    EXPECT_NE(output.text().find("INSTANCE ID"), std::string::npos);
    EXPECT_NE(output.text().find("caps"), std::string::npos);
    EXPECT_NE(output.text().find("\n2 capabilities objects\n"), std::string::npos);
    EXPECT_EQ(manager.path.className(), "ZANTH_AccountManagementCapabilities");
}

TEST_F(ServiceCommands, Other_formats_have_the_whole_instances) {
    manager.instances = {service("accounts")};
    EXPECT_EQ(run({"service", "--json"}), 0);
    const auto services = nlohmann::json::parse(output.text());
    ASSERT_EQ(services.size(), 1U);
    EXPECT_EQ(services[0]["properties"]["EnabledState"], 5);
    EXPECT_FALSE(manager.properties);
    EXPECT_EQ(run({"capabilities", "--format", "mof"}), 0);
    EXPECT_NE(output.text().find("instance of ZANTH_AccountManagementService"), std::string::npos);
}

TEST_F(ServiceCommands, The_tree_shows_each_object_once_below_what_leads_to_it) {
    const auto system = named("ZANTH_ComputerSystem", "host");
    const auto first = named("ZANTH_AccountManagementService", "first");
    const auto second = named("ZANTH_AccountManagementService", "second");
    const auto capabilities = named("ZANTH_AccountManagementCapabilities", "caps");
    manager.instances = {cim::Instance(system)};
    manager.associated =
        [&](const cim::ObjectPath& path,
            const client::AssociationFilter& filter) -> std::vector<cim::ObjectPath> {
        const bool hosted = filter.assocClass == "ZANTH_AccountHostedService";
        if (path.className() == system.className()) {
            return hosted ? std::vector{first, second} : std::vector<cim::ObjectPath>();
        }
        if (path.className() == first.className()) {
            // Associations lead back, and two services may share what they can do.
            return hosted ? std::vector{system} : std::vector{capabilities};
        }
        return hosted ? std::vector<cim::ObjectPath>() : std::vector{first, second};
    };
    EXPECT_EQ(run({"tree"}), 0) << errors.text();
    EXPECT_EQ(output.text(),
              "ZANTH_ComputerSystem host\n"
              "├── ZANTH_AccountManagementService first  (ZANTH_AccountHostedService)\n"
              "│   └── ZANTH_AccountManagementCapabilities caps  (ZANTH_SimElementCapabilities)\n"
              "└── ZANTH_AccountManagementService second  (ZANTH_AccountHostedService)\n");
}

TEST_F(ServiceCommands, A_tree_without_systems_is_empty) {
    EXPECT_EQ(run({"tree"}), 0);
    EXPECT_EQ(output.text(), "");
    EXPECT_EQ(manager.path.className(), "ZANTH_ComputerSystem");
}

TEST_F(ServiceCommands, Names_in_the_tree_are_escaped) {
    manager.instances = {cim::Instance(named("ZANTH_ComputerSystem", "a\x1b[2J\nb"))};
    EXPECT_EQ(run({"tree"}), 0);
    EXPECT_EQ(output.text(), "ZANTH_ComputerSystem a\\x001B[2J\\nb\n");
}

TEST_F(ServiceCommands, A_tree_has_a_text_form_only) {
    EXPECT_EQ(run({"tree", "--json"}), ExitUsage);
    EXPECT_EQ(errors.text(), "qelosim: a tree has a text form only (see qelosim tree --help)\n");
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(ServiceCommands, An_error_behind_the_first_object_is_reported) {
    manager.instances = {cim::Instance(named("ZANTH_ComputerSystem", "host"))};
    manager.failWith(client::CimError(6, "gone"));
    EXPECT_EQ(run({"tree"}), 6);
    EXPECT_EQ(errors.text(), "qelosim: tree: gone (CIM_ERR_NOT_FOUND, 6)\n");
}

} // namespace
} // namespace qelo::cli
