#include "SchemaFixture.h"

namespace qelo::schema::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;

class InheritanceTest : public SchemaTest {
protected:
    void SetUp() override {
        read(std::string(standardQualifiers) + R"(
            [Abstract, Description("base")] class Base {
                [Key, Description("the name")] string Name;
                uint16 State = 5;
                uint32 Start([In] string How);
            };)");
    }
};

TEST_F(InheritanceTest, A_subclass_has_what_it_inherits_marked_as_such) {
    read("class Sub : base { string Own; };");
    const cim::Class& sub = known("Sub");
    EXPECT_EQ(sub.superclass, "Base");
    EXPECT_TRUE(property("Sub", "Name").propagated);
    EXPECT_EQ(property("Sub", "Name").origin, "Base");
    EXPECT_FALSE(property("Sub", "Own").propagated);
    EXPECT_THAT(repository.keyNames(sub), ElementsAre("Name"));
    ASSERT_NE(sub.method("Start"), nullptr);
    EXPECT_TRUE(sub.method("Start")->propagated);
    EXPECT_EQ(sub.method("Start")->origin, "Base");
}

TEST_F(InheritanceTest, Qualifiers_reach_subclasses_as_their_flavors_say) {
    read("class Sub : Base {};");
    EXPECT_FALSE(known("Sub").isAbstract()); // restricted
    const cim::Qualifier* description = cim::findQualifier(known("Sub").qualifiers, "Description");
    ASSERT_NE(description, nullptr);
    EXPECT_TRUE(description->propagated);
    EXPECT_TRUE(cim::hasFlag(property("Sub", "Name").qualifiers, "Key"));
}

TEST_F(InheritanceTest, An_override_keeps_key_default_and_origin) {
    read("class Sub : Base { [Override(\"State\"), Description(\"mine\")] uint16 State;"
         " [Override(\"Name\")] string Name; };");
    const cim::PropertyDeclaration& state = property("Sub", "State");
    EXPECT_FALSE(state.propagated);
    EXPECT_EQ(state.origin, "Base");
    EXPECT_EQ(state.defaultValue.asUnsigned(), 5U);
    EXPECT_EQ(cim::findQualifier(state.qualifiers, "Description")->value.asString(), "mine");
    EXPECT_TRUE(cim::hasFlag(property("Sub", "Name").qualifiers, "Key"));
    ASSERT_EQ(known("Sub").properties.size(), 2U);
    EXPECT_EQ(known("Sub").properties[0].name, "Name"); // the order of the superclass
    // What is overridden stays so below, without the word for it.
    read("class Deeper : Sub {};");
    EXPECT_EQ(cim::findQualifier(property("Deeper", "State").qualifiers, "Override"), nullptr);
}

TEST_F(InheritanceTest, What_contradicts_the_superclass_is_refused) {
    EXPECT_THAT(errorOf("class S : Base { uint32 State; };"), HasSubstr("another type"));
    EXPECT_THAT(errorOf("class S : Base { uint16 State[]; };"), HasSubstr("another type"));
    EXPECT_THAT(errorOf("class S : Base { [Key] string Other; };"), HasSubstr("new key"));
    EXPECT_THAT(errorOf("class S : Base { [Override(\"None\")] string None; };"),
                HasSubstr("does not have"));
    EXPECT_THAT(errorOf("class S : Base { [Override(\"Name\")] string Title; };"),
                HasSubstr("does not have"));
    EXPECT_THAT(errorOf("class S : Base { [Key(false)] string Name; };"),
                HasSubstr("must not change its qualifier Key"));
    EXPECT_THAT(errorOf("class S : Base { uint16 Start([In] string How); };"),
                HasSubstr("another signature"));
    EXPECT_THAT(errorOf("class S : Base { uint32 Start(); };"), HasSubstr("another signature"));
    EXPECT_THAT(errorOf("class S : Base { string A; string a; };"), HasSubstr("twice"));
    EXPECT_THAT(errorOf("[Association] class S : Base {};"), HasSubstr("associations both"));
    EXPECT_THAT(errorOf("class S { Base ref Other; };"), HasSubstr("not an association"));
    EXPECT_EQ(repository.find(nameSpace, "S"), nullptr);
}

TEST_F(InheritanceTest, A_subclass_may_add_the_first_keys) {
    read("class Plain { string Id; }; class Keyed : Plain { [Key] string Id; [Key] string B; };");
    EXPECT_THAT(repository.keyNames(known("Keyed")), ElementsAre("Id", "B"));
    EXPECT_TRUE(repository.keyNames(known("Plain")).empty());
}

} // namespace
} // namespace qelo::schema::testing
