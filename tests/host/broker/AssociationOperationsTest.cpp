// Association operations: who is asked, and what is filtered.
#include "DispatcherFixture.h"

#include <broker/AssociationRoles.h>

namespace qelo::broker::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class AssociationOperationsTest : public DispatcherTest {
protected:
    std::vector<std::string> associators(const client::AssociationFilter& filter,
                                         const char* from = "one") {
        std::vector<std::string> found;
        connection->associators(widget(from), filter, {}, [&](const cim::Instance& instance) {
            found.push_back(instance.path().toText(false, false));
        });
        std::vector<std::string> byName;
        connection->associatorNames(widget(from), filter, [&](const cim::ObjectPath& path) {
            byName.push_back(path.toText(false, false));
        });
        EXPECT_EQ(found, byName);
        return found;
    }
    std::size_t references(const char* resultClass, const char* role) {
        const client::AssociationFilter filter = {"", resultClass, role, ""};
        std::size_t found = 0;
        connection->references(widget("one"), filter, {}, [&](const cim::Instance& pair) {
            EXPECT_EQ(pair.className(), "TEST_Pair");
            ++found;
        });
        std::size_t byName = 0;
        connection->referenceNames(widget("one"), filter, [&](const cim::ObjectPath& path) {
            EXPECT_EQ(path.key("First")->asReference(), widget("one"));
            ++byName;
        });
        EXPECT_EQ(found, byName);
        return found;
    }
    const std::vector<std::string> two_ = {"TEST_Widget.Name=\"two\""};
};

TEST_F(AssociationOperationsTest, Without_a_filter_every_association_answers) {
    EXPECT_EQ(associators({}), two_);
    EXPECT_THAT(associators({}, "two"), ElementsAre("TEST_Widget.Name=\"one\""));
    EXPECT_THAT(associators({}, "three"), IsEmpty());
    EXPECT_EQ(references("", ""), 1U);
}

TEST_F(AssociationOperationsTest, The_provider_hears_its_own_class_for_a_superclass) {
    // The provider answers to the name TEST_Pair only.
    EXPECT_EQ(associators({"TEST_Link", "", "", ""}), two_);
    EXPECT_EQ(associators({"test_pair", "", "", ""}), two_);
    EXPECT_EQ(references("TEST_Link", ""), 1U);
}

TEST_F(AssociationOperationsTest, Another_association_class_is_not_asked) {
    EXPECT_THAT(associators({"TEST_Other", "", "", ""}), IsEmpty());
    EXPECT_EQ(references("TEST_Other", ""), 0U);
}

TEST_F(AssociationOperationsTest, Results_are_filtered_by_class) {
    EXPECT_EQ(associators({"", "TEST_Thing", "", ""}), two_);
    EXPECT_EQ(associators({"", "TEST_Widget", "", ""}), two_);
    EXPECT_THAT(associators({"", "TEST_Gadget", "", ""}), IsEmpty());
}

TEST_F(AssociationOperationsTest, Results_are_filtered_by_role) {
    EXPECT_EQ(associators({"", "", "First", ""}), two_);
    EXPECT_EQ(associators({"", "", "first", "SECOND"}), two_);
    EXPECT_EQ(associators({"", "", "", "Second"}), two_);
    EXPECT_THAT(associators({"", "", "Second", ""}), IsEmpty());
    EXPECT_THAT(associators({"", "", "", "First"}), IsEmpty());
    EXPECT_THAT(associators({"", "", "Third", ""}), IsEmpty());
    EXPECT_EQ(references("", "First"), 1U);
    EXPECT_EQ(references("", "Second"), 0U);
}

TEST_F(AssociationOperationsTest, A_role_is_judged_even_when_its_property_is_not_wanted) {
    std::vector<cim::Instance> found;
    connection->references(widget("one"), {"", "", "First", ""}, std::vector<std::string>{"note"},
                           [&](const cim::Instance& pair) { found.push_back(pair); });
    ASSERT_EQ(found.size(), 1U);
    ASSERT_EQ(found[0].properties().size(), 1U);
    EXPECT_EQ(found[0].properties()[0].name, "Note");
}

TEST_F(AssociationOperationsTest, A_property_list_limits_what_comes) {
    connection->associators(widget("one"), {}, std::vector<std::string>{"Color"},
                            [](const cim::Instance& instance) {
                                ASSERT_EQ(instance.properties().size(), 1U);
                                EXPECT_EQ(instance.properties()[0].value.asString(), "linked");
                            });
}

TEST_F(AssociationOperationsTest, A_provider_without_references_is_trusted_with_the_roles) {
    dispatcher->add(
        {"TEST_Chain", {nameSpace}, "Chain", "testwidgets", {ProviderType::Association}});
    std::vector<std::string> found;
    connection->associators(
        widget("one"), {"TEST_Chain", "", "Any", ""}, {},
        [&](const cim::Instance& instance) { found.push_back(instance.className()); });
    EXPECT_THAT(found, ElementsAre("TEST_Gadget"));
    // Its lack of other operations does not spoil the answers of other providers.
    EXPECT_EQ(references("", ""), 1U);
}

TEST_F(AssociationOperationsTest, A_single_provider_that_cannot_is_an_error) {
    dispatcher->add(
        {"TEST_Chain", {nameSpace}, "Chain", "testwidgets", {ProviderType::Association}});
    const auto error = errorOf([&] {
        connection->associatorNames(widget("one"), {"TEST_Chain", "", "", ""}, [](const auto&) {});
    });
    EXPECT_EQ(error.code(), 7U);
}

TEST_F(AssociationOperationsTest, An_unknown_namespace_is_refused) {
    cim::ObjectPath path = widget("one");
    path.setNameSpace("root/none");
    EXPECT_EQ(errorOf([&] { connection->associators(path, {}, {}, [](const auto&) {}); }).code(),
              3U);
}

TEST_F(AssociationOperationsTest, The_class_of_the_source_is_found_in_any_spelling) {
    cim::ObjectPath path = widget("one");
    path.setClassName("test_widget");
    int found = 0;
    connection->associatorNames(path, {"", "", "First", ""}, [&](const auto&) { ++found; });
    EXPECT_EQ(found, 1);
}

// ---- Roles, case by case

cim::ObjectPath end(const char* className, std::uint64_t number) {
    cim::ObjectPath path("root/test", className);
    path.setKey("Number", cim::Value::unsignedInteger(cim::Type::UInt64, number));
    return path;
}

bool sameClass(const std::string& left, const std::string& right) {
    return cim::sameName(left, right);
}

TEST(AssociationRolesTest, The_same_number_of_another_width_is_the_same_key) {
    cim::ObjectPath narrow("root/test", "A");
    narrow.setKey("number", cim::Value::unsignedInteger(cim::Type::UInt16, 5));
    EXPECT_TRUE(sameObject(end("A", 5), narrow, sameClass));
    EXPECT_FALSE(sameObject(end("A", 6), narrow, sameClass));
    EXPECT_FALSE(sameObject(end("B", 5), narrow, sameClass));
    EXPECT_FALSE(sameObject(end("A", 5), cim::ObjectPath("root/test", "A"), sameClass));
}

TEST(AssociationRolesTest, An_object_linked_to_itself_is_its_own_partner) {
    cim::Instance loop(cim::ObjectPath("root/test", "TEST_Loop"));
    loop.setProperty("From", cim::Value::reference(end("A", 1)));
    loop.setProperty("To", cim::Value::reference(end("A", 1)));
    EXPECT_THAT(otherEnds(loop, end("A", 1), "From", "", sameClass), ElementsAre(end("A", 1)));
    EXPECT_EQ(otherEnds(loop, end("A", 1), "", "", sameClass).size(), 2U);
    EXPECT_THAT(otherEnds(loop, end("A", 2), "", "", sameClass), IsEmpty());
}

TEST(AssociationRolesTest, References_in_the_path_count_as_well) {
    cim::ObjectPath path("root/test", "TEST_Link");
    path.setKey("From", cim::Value::reference(end("A", 1)));
    path.setKey("To", cim::Value::reference(end("B", 2)));
    const cim::Instance link(path);
    EXPECT_EQ(referencesOf(link).size(), 2U);
    EXPECT_TRUE(playsRole(link, end("B", 2), "to", sameClass));
    EXPECT_FALSE(playsRole(link, end("B", 2), "from", sameClass));
    EXPECT_THAT(otherEnds(link, end("A", 1), "", "To", sameClass), ElementsAre(end("B", 2)));
}

} // namespace
} // namespace qelo::broker::testing
