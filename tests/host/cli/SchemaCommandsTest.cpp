// The commands on classes.
#include "Program.h"

#include <nlohmann/json.hpp>

#include <gmock/gmock.h>

namespace qelo::cli {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;

cim::Qualifier flag(const char* name) {
    cim::Qualifier qualifier;
    qualifier.name = name;
    qualifier.value = cim::Value::boolean(true);
    return qualifier;
}

class SchemaCommandsTest : public Program {
protected:
    void SetUp() override {
        cim::PropertyDeclaration name;
        name.name = "Name";
        name.origin = "Base";
        name.propagated = true;
        name.qualifiers = {flag("Key")};
        cim::PropertyDeclaration sizes;
        sizes.name = "Sizes";
        sizes.type = cim::Type::UInt16;
        sizes.array = true;
        sizes.arraySize = 2;
        sizes.defaultValue = cim::Value::array(cim::Type::UInt16,
                                               {cim::Value::unsignedInteger(cim::Type::UInt16, 7)});
        sizes.origin = "Thing";
        cim::MethodDeclaration method;
        method.name = "Do";
        cim::ParameterDeclaration parameter;
        parameter.name = "Other";
        parameter.type = cim::Type::Reference;
        parameter.referenceClass = "Thing";
        parameter.qualifiers = {flag("In")};
        method.parameters = {parameter};
        manager.cimClass.name = "Thing";
        manager.cimClass.superclass = "Base";
        cim::Qualifier description;
        description.name = "Description";
        description.value = cim::Value::string("a \"thing\"\x1b");
        manager.cimClass.qualifiers = {description};
        manager.cimClass.properties = {name, sizes};
        manager.cimClass.methods = {method};
        manager.classNames = {"A", "B"};
    }
};

constexpr char kMof[] = R"([Description ("a \"thing\"\x001B")]
class Thing : Base {
    // from Base
    [Key]
    string Name;

    uint16 Sizes[2] = {7};

    uint32 Do(
        [In]
        Thing REF Other);
};
)";

TEST_F(SchemaCommandsTest, A_class_is_printed_as_MOF) {
    EXPECT_EQ(run({"gc", "Thing"}), ExitSuccess);
    EXPECT_EQ(output.text(), kMof);
    EXPECT_EQ(manager.operation, "getClass");
    EXPECT_EQ(manager.path.toText(), "root/cimv2:Thing");
}

TEST_F(SchemaCommandsTest, Text_and_mof_are_the_same) {
    EXPECT_EQ(run({"gc", "root/other:Thing", "--format", "mof"}), ExitSuccess);
    EXPECT_EQ(output.text(), kMof);
    EXPECT_EQ(manager.path.nameSpace(), "root/other");
}

TEST_F(SchemaCommandsTest, A_class_has_a_JSON_form) {
    EXPECT_EQ(run({"gc", "Thing", "--json"}), ExitSuccess);
    const auto json = nlohmann::json::parse(output.text());
    EXPECT_EQ(json["class"], "Thing");
    EXPECT_EQ(json["superclass"], "Base");
    EXPECT_EQ(json["qualifiers"]["Description"], "a \"thing\"\x1b");
    EXPECT_EQ(json["properties"][0]["qualifiers"]["Key"], true);
    EXPECT_EQ(json["properties"][0]["origin"], "Base");
    EXPECT_EQ(json["properties"][1]["type"], "uint16");
    EXPECT_EQ(json["properties"][1]["size"], 2);
    EXPECT_EQ(json["properties"][1]["default"], nlohmann::json::array({7}));
    EXPECT_EQ(json["methods"][0]["parameters"][0]["class"], "Thing");
}

TEST_F(SchemaCommandsTest, Names_of_classes_stand_one_on_a_line) {
    EXPECT_EQ(run({"ecn"}), ExitSuccess);
    EXPECT_EQ(output.text(), "A\nB\n");
    EXPECT_EQ(manager.operation, "enumerateClassNames");
    EXPECT_EQ(manager.path.className(), "");
    EXPECT_EQ(manager.path.nameSpace(), "root/cimv2");
    EXPECT_FALSE(manager.deep);
}

TEST_F(SchemaCommandsTest, Names_below_a_class_are_asked_for_deeply) {
    EXPECT_EQ(run({"ecn", "Thing", "--deep", "--json"}), ExitSuccess);
    EXPECT_EQ(nlohmann::json::parse(output.text()), nlohmann::json::array({"A", "B"}));
    EXPECT_EQ(manager.path.className(), "Thing");
    EXPECT_TRUE(manager.deep);
}

TEST_F(SchemaCommandsTest, Names_have_no_MOF_form) {
    EXPECT_EQ(run({"ecn", "--format", "mof"}), ExitUsage);
    EXPECT_THAT(errors.text(), HasSubstr("no MOF form"));
}

TEST_F(SchemaCommandsTest, A_class_is_asked_for_not_an_instance) {
    EXPECT_EQ(run({"gc", "Thing.Name=\"x\""}), ExitUsage);
    EXPECT_EQ(run({"gc"}), ExitUsage);
    EXPECT_EQ(manager.connections, 0);
}

TEST_F(SchemaCommandsTest, An_unknown_class_is_one_line_and_its_code) {
    manager.failWith(client::CimError(6, "no such class: \"Thing\""));
    EXPECT_EQ(run({"gc", "Thing"}), 6);
    EXPECT_THAT(errors.text(), StartsWith("qelosim: gc: no such class: \"Thing\""));
    EXPECT_EQ(output.text(), "");
}

TEST_F(SchemaCommandsTest, Folders_of_the_schema_reach_the_object_manager) {
    EXPECT_EQ(run({"ecn", "--schema-dir", "/a", "--schema-dir", "/b"}), ExitSuccess);
    EXPECT_EQ(options().schemaDirectories, (std::vector<std::string>{"/a", "/b"}));
    EXPECT_EQ(run({"ecn", "--schema-dir", ""}), ExitUsage);
}

} // namespace
} // namespace qelo::cli
