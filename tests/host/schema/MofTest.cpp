#include "SchemaFixture.h"

namespace qelo::schema::testing {
namespace {

using cim::Type;
using cim::Value;
using ::testing::ElementsAre;

class MofTest : public SchemaTest {
protected:
    // The default value that a property gets from such a text.
    Value defaultOf(const std::string& type, const std::string& value) {
        ClassRepository fresh;
        repository = std::move(fresh);
        const bool array = type.find('[') != std::string::npos;
        const std::string bare = type.substr(0, type.find('['));
        read("class T { " + bare + " P" + (array ? type.substr(type.find('[')) : "") + " = " +
             value + "; };");
        return property("T", "P").defaultValue;
    }
};

TEST_F(MofTest, A_class_has_what_its_text_declares) {
    read(std::string(standardQualifiers) + R"(
        // A comment, /* and another */
        [Description("A " /* inside */ "thing")]
        class TEST_Thing {
            [Key] string Name;
            uint16 States[] = {2, 3};
            string Fixed[4];
            boolean On = TRUE;
            [Description("Does it")] uint32 Do([In] string What, [In(false)] uint8 Times[3]);
        };)");
    const cim::Class& thing = known("test_thing");
    EXPECT_EQ(thing.name, "TEST_Thing");
    EXPECT_EQ(cim::findQualifier(thing.qualifiers, "description")->value.asString(), "A thing");
    EXPECT_THAT(repository.keyNames(thing), ElementsAre("Name"));
    EXPECT_EQ(thing.property("States")->defaultValue.toText(), "2,3");
    EXPECT_TRUE(thing.property("States")->array);
    EXPECT_FALSE(thing.property("States")->arraySize);
    EXPECT_EQ(thing.property("Fixed")->arraySize, 4U);
    EXPECT_TRUE(thing.property("On")->defaultValue.asBoolean());
    EXPECT_EQ(thing.property("On")->origin, "TEST_Thing");
    ASSERT_NE(thing.method("do"), nullptr);
    const cim::MethodDeclaration& method = *thing.method("do");
    EXPECT_EQ(method.returnType, Type::UInt32);
    ASSERT_EQ(method.parameters.size(), 2U);
    EXPECT_TRUE(cim::hasFlag(method.parameters[0].qualifiers, "In"));
    EXPECT_FALSE(cim::hasFlag(method.parameters[1].qualifiers, "In"));
    EXPECT_EQ(method.parameters[1].arraySize, 3U);
}

TEST_F(MofTest, Integers_are_read_in_all_four_number_systems) {
    EXPECT_EQ(defaultOf("uint32", "42").asUnsigned(), 42U);
    EXPECT_EQ(defaultOf("uint32", "0x2A").asUnsigned(), 42U);
    EXPECT_EQ(defaultOf("uint32", "052").asUnsigned(), 42U);
    EXPECT_EQ(defaultOf("uint32", "101010b").asUnsigned(), 42U);
    EXPECT_EQ(defaultOf("uint32", "0").asUnsigned(), 0U);
    EXPECT_EQ(defaultOf("uint32", "+7").asUnsigned(), 7U);
    EXPECT_EQ(defaultOf("sint8", "-128").asSigned(), -128);
    EXPECT_EQ(defaultOf("sint64", "-9223372036854775808").asSigned(), INT64_MIN);
    EXPECT_EQ(defaultOf("uint64", "18446744073709551615").asUnsigned(), UINT64_MAX);
}

TEST_F(MofTest, Reals_characters_strings_and_dates_are_read) {
    EXPECT_EQ(defaultOf("real64", "-1.5e+3").asReal(), -1500.0);
    EXPECT_EQ(defaultOf("real32", ".5").asReal(), 0.5);
    EXPECT_EQ(defaultOf("real32", "-.5").asReal(), -0.5);
    EXPECT_EQ(defaultOf("real64", "3").asReal(), 3.0);
    EXPECT_EQ(defaultOf("char16", "'a'").asUnsigned(), 'a');
    EXPECT_EQ(defaultOf("char16", R"('\'')").asUnsigned(), '\'');
    EXPECT_EQ(defaultOf("char16", R"('\x263A')").asUnsigned(), 0x263AU);
    EXPECT_EQ(defaultOf("char16", "'\"'").asUnsigned(), '"');
    EXPECT_EQ(defaultOf("char16", "65").asUnsigned(), 65U);
    EXPECT_EQ(defaultOf("string", R"("a\tb\"\\" " c")").asString(), "a\tb\"\\ c");
    EXPECT_EQ(defaultOf("string", "\"\xC3\xA9\"").asString(), "\xC3\xA9");
    EXPECT_EQ(defaultOf("datetime", "\"20261121000000.000000+000\"").asDateTime().text(),
              "20261121000000.000000+000");
}

TEST_F(MofTest, Null_has_the_type_of_its_element) {
    const Value scalar = defaultOf("uint16", "NULL");
    EXPECT_TRUE(scalar.isNull());
    EXPECT_EQ(scalar.type(), Type::UInt16);
    const Value array = defaultOf("datetime[]", "null");
    EXPECT_TRUE(array.isNull());
    EXPECT_TRUE(array.isArray());
    const Value elements = defaultOf("string[]", "{\"a\", NULL}");
    ASSERT_EQ(elements.asArray().size(), 2U);
    EXPECT_TRUE(elements.asArray()[1].isNull());
    EXPECT_TRUE(defaultOf("string[]", "{}").asArray().empty());
}

TEST_F(MofTest, Flavors_come_from_the_declaration_and_from_the_use) {
    read(std::string(standardQualifiers) +
         "[Description(\"x\") : Restricted DisableOverride] class T { [MaxLen(3)] string P; };");
    const cim::Qualifier& description = *cim::findQualifier(known("T").qualifiers, "Description");
    EXPECT_FALSE(description.flavor.toSubclass);
    EXPECT_FALSE(description.flavor.overridable);
    EXPECT_TRUE(description.flavor.translatable);
    const cim::QualifierType* key = repository.findQualifierType(nameSpace, "KEY");
    ASSERT_NE(key, nullptr);
    EXPECT_EQ(key->scopes, cim::QualifierType::ScopeProperty | cim::QualifierType::ScopeReference);
    EXPECT_FALSE(key->flavor.overridable);
    EXPECT_EQ(repository.qualifierTypes(nameSpace).size(), 8U);
}

TEST_F(MofTest, An_undeclared_qualifier_has_the_type_of_its_value) {
    read("[Flag, Text(\"x\"), List{\"a\", \"b\"}, Off(false), Number(1.5)] class T {};");
    const auto& qualifiers = known("T").qualifiers;
    EXPECT_TRUE(cim::hasFlag(qualifiers, "Flag"));
    EXPECT_EQ(cim::findQualifier(qualifiers, "Text")->value.type(), Type::String);
    EXPECT_TRUE(cim::findQualifier(qualifiers, "List")->value.isArray());
    EXPECT_FALSE(cim::hasFlag(qualifiers, "Off"));
    EXPECT_EQ(cim::findQualifier(qualifiers, "Number")->value.type(), Type::Real64);
}

TEST_F(MofTest, An_include_is_read_where_it_stands) {
    files["base.mof"] = "class Base { string A; };";
    read("#pragma include (\"base.mof\")\n#pragma locale (\"en_US\")\nclass Sub : Base {};");
    EXPECT_NE(known("Sub").property("A"), nullptr);
}

TEST_F(MofTest, The_namespace_pragma_sends_what_follows_to_another_namespace) {
    read("class A {};\n#pragma namespace (\"/root/other/\")\nclass B {};");
    EXPECT_EQ(repository.find(nameSpace, "B"), nullptr);
    EXPECT_NE(repository.find("ROOT/Other", "b"), nullptr);
    EXPECT_THAT(repository.nameSpaces(), ElementsAre("root/test", "root/other"));
}

TEST_F(MofTest, References_point_to_classes) {
    read(std::string(standardQualifiers) +
         "[Association] class Link { [Key] Other ref Left; [Key] Other REF Right; };");
    EXPECT_EQ(property("Link", "Left").type, Type::Reference);
    EXPECT_EQ(property("Link", "Right").referenceClass, "Other");
}

TEST_F(MofTest, Instances_refer_to_each_other_by_alias_or_path) {
    read(std::string(standardQualifiers) + R"(
        class Thing { [Key] string Name; uint16 Size = 7; };
        [Association] class Link { [Key] Thing ref Left; [Key] Thing ref Right; };
        instance of Thing as $one { Name = "one"; };
        instance of Link { Left = $ONE; Right = "Thing.Name=\"two\""; };)");
    const auto links = repository.instances(nameSpace, "Link");
    ASSERT_EQ(links.size(), 1U);
    const cim::ObjectPath& left = links[0]->property("Left")->asReference();
    EXPECT_EQ(left.toText(), "root/test:Thing.Name=\"one\"");
    EXPECT_EQ(links[0]->path().key("Right")->asReference().toText(),
              "root/test:Thing.Name=\"two\"");
    const auto things = repository.instances(nameSpace, "Thing");
    ASSERT_EQ(things.size(), 1U);
    EXPECT_EQ(things[0]->property("Size")->asUnsigned(), 7U);
}

TEST_F(MofTest, A_byte_order_mark_is_skipped) {
    read("\xEF\xBB\xBF"
         "class T {};");
    EXPECT_EQ(known("T").name, "T");
}

} // namespace
} // namespace qelo::schema::testing
