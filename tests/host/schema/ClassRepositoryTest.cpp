#include "SchemaFixture.h"

namespace qelo::schema::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class ClassRepositoryTest : public SchemaTest {};

TEST_F(ClassRepositoryTest, Namespaces_compare_without_case_and_outer_slashes) {
    repository.addNameSpace("root/cimv2");
    repository.addNameSpace("/ROOT/cimv2/");
    EXPECT_THAT(repository.nameSpaces(), ElementsAre("root/cimv2"));
    EXPECT_TRUE(repository.hasNameSpace("root/CIMV2/"));
    EXPECT_FALSE(repository.hasNameSpace("root"));
    EXPECT_THROW(repository.addNameSpace("//"), SchemaError);
}

TEST_F(ClassRepositoryTest, Subclasses_stand_behind_their_superclass) {
    read("class A {}; class B : A {}; class C : B {}; class D : A {}; class E {};");
    EXPECT_THAT(names("", false), ElementsAre("A", "E"));
    EXPECT_THAT(names("a", false), ElementsAre("B", "D"));
    EXPECT_THAT(names("A", true), ElementsAre("B", "D", "C"));
    EXPECT_THAT(names("", true), ElementsAre("A", "E", "B", "D", "C"));
    EXPECT_THAT(names("C", true), IsEmpty());
    EXPECT_THAT(names("None", true), IsEmpty());
    EXPECT_THAT(repository.subclasses("root/none", "", true), IsEmpty());
}

TEST_F(ClassRepositoryTest, Descent_is_known_for_known_classes_only) {
    read("class A {}; class B : A {}; class C : B {};");
    EXPECT_TRUE(repository.isA(nameSpace, "c", "A"));
    EXPECT_TRUE(repository.isA(nameSpace, "C", "C"));
    EXPECT_FALSE(repository.isA(nameSpace, "A", "C"));
    EXPECT_FALSE(repository.isA(nameSpace, "X", "X"));
    EXPECT_FALSE(repository.isA("root/none", "C", "A"));
}

TEST_F(ClassRepositoryTest, The_same_declaration_again_changes_nothing) {
    read("class A { string P = \"x\"; }; class B : A {};");
    const cim::Class* before = repository.find(nameSpace, "A");
    read("CLASS a { STRING p = \"x\"; };");
    EXPECT_EQ(repository.find(nameSpace, "A"), before);
    EXPECT_THAT(names("A", false), ElementsAre("B"));
    EXPECT_NE(errorOf("class A { string P = \"y\"; };"), "");
    EXPECT_NE(errorOf("class A { string P = \"x\"; uint32 M(); };"), "");
    EXPECT_NE(errorOf("[Q] class A { string P = \"x\"; };"), "");
    EXPECT_NE(errorOf("class B {};"), "");
}

TEST_F(ClassRepositoryTest, The_same_name_is_another_class_in_another_namespace) {
    read("class A { string P; };\n#pragma namespace(\"root/b\")\nclass A { uint16 P; };");
    EXPECT_EQ(repository.find(nameSpace, "A")->property("P")->type, cim::Type::String);
    EXPECT_EQ(repository.find("root/b", "A")->property("P")->type, cim::Type::UInt16);
}

TEST_F(ClassRepositoryTest, An_instance_gets_its_path_from_its_keys) {
    read(std::string(standardQualifiers) + "class T { [Key] uint16 Id; string A = \"x\"; };");
    cim::Instance given(cim::ObjectPath("", "t"));
    given.setProperty("id", cim::Value::unsignedInteger(cim::Type::UInt16, 3));
    EXPECT_EQ(repository.add(nameSpace, given).toText(), "root/test:T.Id=3");
    EXPECT_EQ(repository.add(nameSpace, given).toText(), "root/test:T.Id=3"); // the same again
    ASSERT_EQ(repository.instances(nameSpace, "T").size(), 1U);
    EXPECT_EQ(repository.instances(nameSpace, "T")[0]->property("A")->asString(), "x");
    given.setProperty("Id", cim::Value::string("3"));
    EXPECT_THROW(repository.add(nameSpace, given), SchemaError);
}

} // namespace
} // namespace qelo::schema::testing
